// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QWidget>

class QPushButton;

namespace Mtk::Widget {
class MLabel;
class MProgressBar;
} // namespace Mtk::Widget

// Fifth page of the wizard: how far the join has come. Widget sets every value; the page decides nothing. Its
// cancel button is never enabled, since a run cannot be abandoned.
class SettingUpWidget : public QWidget
{
    Q_OBJECT

public:
    explicit SettingUpWidget(QWidget *parent);

    // Percent, 0 to 100; the bar ignores what is outside.
    void setProgressValue(const int &value);

    // Called each time a join starts; leaves the bar as it is.
    void restoreUI();

Q_SIGNALS:
    void sigCancelSetting();

public Q_SLOTS:
    void onCancelSetting();

private:
    void createInterface();
    void createConnections();

    Mtk::Widget::MProgressBar *m_progressBar = nullptr;
    Mtk::Widget::MLabel *m_statusLabel = nullptr;
    QPushButton *m_settingCancelButton = nullptr;
};
