// SPDX-License-Identifier: Apache-2.0
#include "widgets/switchwidget.h"

#include "mtk/mswitchbutton.h"
#include "widgets/labels.h"

#include <QHBoxLayout>
#include <QMouseEvent>
#include <QSignalBlocker>

using Mtk::Widget::MSwitchButton;

namespace mcc::widgets {

namespace {
constexpr int kRowHeight = 36;
constexpr QMargins kRowMargins(18, 0, 8, 0);
} // namespace

SwitchWidget::SwitchWidget(QWidget *parent, QWidget *leftWidget)
    : SettingsItem(parent)
    , m_leftWidget(leftWidget != nullptr ? leftWidget : new QLabel)
    , m_switchBtn(new MSwitchButton)
    , m_mainLayout(new QHBoxLayout(this))
{
    setFixedHeight(kRowHeight);

    auto *left = new QHBoxLayout;
    left->addWidget(m_leftWidget);
    m_mainLayout->setSpacing(0);
    m_mainLayout->setContentsMargins(kRowMargins);
    m_mainLayout->addLayout(left);
    m_mainLayout->addWidget(m_switchBtn, 0, Qt::AlignVCenter);
    m_leftWidget->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Preferred);

    connect(m_switchBtn, &MSwitchButton::toggled, this, &SwitchWidget::checkedChanged);
}

SwitchWidget::SwitchWidget(const QString &title, QWidget *parent)
    : SwitchWidget(parent, new NormalLabel(title))
{
    m_switchBtn->setAccessibleName(title);
}

void SwitchWidget::setChecked(bool checked)
{
    const QSignalBlocker blocker(m_switchBtn);
    m_switchBtn->setChecked(checked);
}

bool SwitchWidget::checked() const
{
    return m_switchBtn->isChecked();
}

QString SwitchWidget::title() const
{
    const auto *label = qobject_cast<QLabel *>(m_leftWidget);
    return label != nullptr ? label->text() : QString();
}

void SwitchWidget::setTitle(const QString &title)
{
    if (auto *label = qobject_cast<QLabel *>(m_leftWidget)) {
        label->setWordWrap(true);
        label->setText(title);
        label->setWordWrap(true);
    }
    setAccessibleName(title);
    m_switchBtn->setAccessibleName(title);
}

void SwitchWidget::mouseReleaseEvent(QMouseEvent *event)
{
    if (!m_switchBtn->geometry().contains(event->pos()))
        Q_EMIT clicked();
    QWidget::mouseReleaseEvent(event);
}

} // namespace mcc::widgets
