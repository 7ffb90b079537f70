// SPDX-License-Identifier: Apache-2.0
#include "finishsettingwidget.h"

#include "pageparts.h"

#include "mtk/mframe.h"
#include "mtk/mlabel.h"
#include "mtk/mpalette.h"
#include "mtk/msuggestbutton.h"

#include <QBoxLayout>
#include <QPushButton>

using Mtk::Gui::MPalette;
using Mtk::Widget::MFrame;
using Mtk::Widget::MLabel;
using Mtk::Widget::MSuggestButton;

namespace {

constexpr int kWarningAlpha = 127;

QString warning()
{
    return FinishSettingWidget::tr("   终端加入域管后将立即重启电脑，\n且只能登录管理员帐号才能解除管控!");
}

} // namespace

FinishSettingWidget::FinishSettingWidget(QWidget *parent)
    : QWidget(parent)
{
    createInterface();
    createConnections();
}

void FinishSettingWidget::createInterface()
{
    QFont font = pageparts::pageFont(pageparts::kHeadingWeight);
    QLabel *title = pageparts::heading(tr("完成配置"), font, this);
    font.setWeight(pageparts::kBodyWeight);

    m_serverIpLabel = new MLabel;
    m_serverIpLabel->setText(QStringLiteral("192"));
    pageparts::setValueLooks(m_serverIpLabel, font);
    m_serverIpLabel->setElideMode(Qt::ElideMiddle);
    m_terminalNameLabel = new MLabel;
    m_terminalNameLabel->setFixedHeight(20);
    m_terminalNameLabel->setWordWrap(true);
    m_terminalNameLabel->setElideMode(Qt::ElideRight);
    m_terminalNameLabel->setFont(font);
    m_terminalNameLabel->setTextFormat(Qt::PlainText);
    QHBoxLayout *addressRow = createRow(tr("域地址:"), m_serverIpLabel, font);
    addressRow->setSpacing(0);

    auto *layout = new QVBoxLayout(this);
    layout->setContentsMargins(10, 0, 10, 12);
    layout->setSpacing(0);
    layout->addWidget(title, 0, Qt::AlignTop | Qt::AlignCenter);
    layout->addLayout(addressRow);
    layout->addSpacing(23);
    layout->addLayout(createRow(tr("终端别名:"), m_terminalNameLabel, font));
    layout->addSpacing(12);
    layout->addWidget(createWarning(font));
    layout->addSpacing(20);
    layout->addLayout(createButtons(font));
}

void FinishSettingWidget::createConnections()
{
    connect(m_backButton, &QPushButton::clicked, this, &FinishSettingWidget::sig_cancel_finish_setting);
    connect(m_finishButton, &MSuggestButton::clicked, this, &FinishSettingWidget::on_finish_setting);
}

QHBoxLayout *FinishSettingWidget::createRow(const QString &captionText, MLabel *value, const QFont &font)
{
    auto *caption = new MLabel;
    pageparts::setCaption(caption, captionText, font);
    auto *row = new QHBoxLayout;
    row->setContentsMargins(0, 0, 0, 0);
    row->addWidget(caption);
    row->addSpacing(10);
    row->addWidget(value);
    return row;
}

MFrame *FinishSettingWidget::createWarning(const QFont &font)
{
    auto *frame = new MFrame;
    frame->setFixedSize(360, 62);
    frame->setFrameRounded(true);
    frame->setBackgroundRole(MPalette::FrameShadowBorder);

    auto *text = new MLabel(frame);
    text->setFixedSize(320, 40);
    text->setFont(font);
    text->setText(warning());
    text->setWordWrap(true);
    text->setAlignment(Qt::AlignHCenter);
    pageparts::setTextColor(text, QColor(0, 0, 0, kWarningAlpha));

    auto *layout = new QVBoxLayout;
    layout->setContentsMargins(20, 10, 20, 10);
    layout->addWidget(text);
    frame->setLayout(layout);
    return frame;
}

QHBoxLayout *FinishSettingWidget::createButtons(const QFont &font)
{
    m_backButton = new QPushButton(tr("上一步"), this);
    m_backButton->setFont(font);
    m_finishButton = new MSuggestButton(this);
    m_finishButton->setText(tr("完成"));
    m_finishButton->setAccessibleDescription(warning().simplified());
    m_finishButton->setFont(font);

    QHBoxLayout *row = pageparts::buttonRow(this, m_backButton, m_finishButton);
    row->setContentsMargins(0, 0, 0, 0);
    return row;
}

void FinishSettingWidget::setServerIP(const QString &address)
{
    m_serverIpLabel->setText(address);
}

void FinishSettingWidget::setTermianlName(const QString &name)
{
    m_terminalNameLabel->setText(name);
}

void FinishSettingWidget::setButtonEnabled(bool enabled)
{
    m_finishButton->setEnabled(enabled);
    m_backButton->setEnabled(enabled);
}

void FinishSettingWidget::on_finish_setting()
{
    setButtonEnabled(false);
    Q_EMIT sigJoinGroup();
}
