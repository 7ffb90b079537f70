// SPDX-License-Identifier: Apache-2.0
#include "settingupwidget.h"

#include "pageparts.h"

#include "mtk/mlabel.h"
#include "mtk/mprogressbar.h"

#include <QBoxLayout>
#include <QFontInfo>
#include <QPushButton>

#include <QDebug>

using Mtk::Widget::MLabel;
using Mtk::Widget::MProgressBar;

SettingUpWidget::SettingUpWidget(QWidget *parent)
    : QWidget(parent)
{
    createInterface();
    createConnections();
}

void SettingUpWidget::createInterface()
{
    QFont font = pageparts::pageFont(pageparts::kHeadingWeight);
    m_statusLabel = new MLabel(this);
    m_statusLabel->setFont(font);
    m_statusLabel->setText(tr("配置中，请稍后"));
    setAccessibleDescription(m_statusLabel->text());
    qDebug().noquote() << "font family:" << QFontInfo(m_statusLabel->font()).family();

    m_progressBar = new MProgressBar(this);
    m_progressBar->setAlignment(Qt::AlignCenter);
    m_progressBar->setFixedSize(320, 8);
    m_progressBar->setTextVisible(false);
    m_progressBar->setRange(0, 100);
    m_progressBar->setValue(0);

    font.setWeight(pageparts::kBodyWeight);
    m_settingCancelButton = new QPushButton(tr("取消"), this);
    m_settingCancelButton->setFixedSize(pageparts::kWideButtonSize);
    m_settingCancelButton->setFont(font);
    m_settingCancelButton->setEnabled(false);

    auto *layout = new QVBoxLayout(this);
    layout->setSpacing(0);
    layout->addWidget(m_statusLabel, 0, Qt::AlignCenter);
    layout->addStretch(12);
    layout->addWidget(m_progressBar, 0, Qt::AlignCenter);
    layout->addStretch(25);
    layout->addWidget(m_settingCancelButton, 0, Qt::AlignCenter);
    layout->setContentsMargins(0, 0, 0, 9);
}

void SettingUpWidget::createConnections()
{
    connect(m_settingCancelButton, &QPushButton::clicked, this, &SettingUpWidget::onCancelSetting);
}

void SettingUpWidget::setProgressValue(const int &value)
{
    m_progressBar->setValue(value);
}

void SettingUpWidget::restoreUI()
{
    m_statusLabel->setText(tr("配置中，请稍后"));
    m_settingCancelButton->setEnabled(false);
}

void SettingUpWidget::onCancelSetting()
{
    m_statusLabel->setText(tr("取消配置中..."));
    m_settingCancelButton->setEnabled(false);
    Q_EMIT sigCancelSetting();
}
