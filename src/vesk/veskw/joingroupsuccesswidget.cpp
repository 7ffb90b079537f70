// SPDX-License-Identifier: Apache-2.0
#include "joingroupsuccesswidget.h"

#include "dbusservices.h"
#include "pageparts.h"

#include "mtk/mlabel.h"

#include <QBoxLayout>
#include <QPushButton>

JoinGroupSuccessWidget::JoinGroupSuccessWidget(QWidget *parent)
    : QWidget(parent)
{
    createConnections(createInterface());
}

QPushButton *JoinGroupSuccessWidget::createInterface()
{
    QFont font = pageparts::pageFont(pageparts::kHeadingWeight);
    setFixedSize(pageparts::kPanelSize);
    auto *label = new Mtk::Widget::MLabel(this);
    label->setFont(font);
    label->setText(tr("终端已成功加入域管,重启电脑生效"));
    setAccessibleDescription(label->text());

    font.setWeight(pageparts::kBodyWeight);
    auto *button = new QPushButton(this);
    button->setFont(font);
    button->setText(tr("立即重启"));
    button->setAccessibleDescription(label->text());
    button->setAutoDefault(true); // outside of dialogs, Enter would not press it

    auto *layout = new QVBoxLayout(this);
    layout->setSpacing(0);
    layout->addWidget(label, 0, Qt::AlignCenter);
    layout->addStretch(25);
    layout->addWidget(button);
    layout->setContentsMargins(10, 8, 10, 10);
    return button;
}

void JoinGroupSuccessWidget::createConnections(QPushButton *rebootButton)
{
    connect(rebootButton, &QPushButton::clicked, this, &JoinGroupSuccessWidget::onRestartComputer);
}

void JoinGroupSuccessWidget::onRestartComputer()
{
    dbusservices::requestReboot();
}
