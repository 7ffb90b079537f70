// SPDX-License-Identifier: Apache-2.0
#include "widgets/lineeditwidget.h"

#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"
#include "widgets/errortip.h"

#include <QDebug>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QMouseEvent>

using Mtk::Widget::MLineEdit;
using Mtk::Widget::MPasswordEdit;

namespace mcc::widgets {

namespace {
constexpr int kTitleWidth = 110;
}

LineEditWidget::LineEditWidget(QFrame *parent)
    : LineEditWidget(false, parent)
{
}

LineEditWidget::LineEditWidget(bool isPasswordMode, QWidget *parent)
    : SettingsItem(parent)
    , m_mainLayout(new QHBoxLayout)
    , m_title(new QLabel)
    , m_edit(isPasswordMode ? new MPasswordEdit : new MLineEdit)
    , m_errTip(new ErrorTip(this))
{
    m_title->setFixedWidth(kTitleWidth);
    m_edit->setContextMenuPolicy(Qt::NoContextMenu);

    m_mainLayout->addWidget(m_title, 0, Qt::AlignVCenter);
    m_mainLayout->addWidget(m_edit, 0, Qt::AlignVCenter);
    setLayout(m_mainLayout);
    setObjectName(QStringLiteral("LineEditWidget"));

    connect(m_edit, &MLineEdit::textChanged, this, &LineEditWidget::hideAlertMessage);
}

void LineEditWidget::addRightWidget(QWidget *widget)
{
    m_mainLayout->addWidget(widget, 0, {});
}

void LineEditWidget::setIsErr(bool err)
{
    m_edit->setAlert(err);
}

void LineEditWidget::setReadOnly(bool readOnly)
{
    m_edit->lineEdit()->setReadOnly(readOnly);
}

void LineEditWidget::showAlertMessage(const QString &text)
{
    qDebug() << "showAlertMessage " << text;
    if (text.isEmpty())
        return;

    const QRect edit = m_edit->geometry();
    const QPoint corner = m_edit->mapToGlobal(QPoint(0, edit.bottom() - edit.top()));
    m_errTip->setText(text);
    m_errTip->show(corner.x(), corner.y());
}

void LineEditWidget::hideAlertMessage()
{
    setIsErr(false);
    m_errTip->hide();
}

void LineEditWidget::setTitle(const QString &title)
{
    m_title->setText(title);
    m_title->setWordWrap(true);
    setAccessibleName(title);
    m_edit->setAccessibleName(title);
}

void LineEditWidget::setText(const QString &text)
{
    m_edit->setText(text);
}

void LineEditWidget::setPlaceholderText(const QString &text)
{
    m_edit->lineEdit()->setPlaceholderText(text);
}

void LineEditWidget::mousePressEvent(QMouseEvent *event)
{
    QWidget::mousePressEvent(event);
    if (event->button() == Qt::LeftButton)
        m_edit->setFocus(Qt::OtherFocusReason);
}

} // namespace mcc::widgets
