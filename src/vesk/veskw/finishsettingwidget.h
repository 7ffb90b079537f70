// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QWidget>

class QHBoxLayout;
class QPushButton;

namespace Mtk::Widget {
class MFrame;
class MLabel;
class MSuggestButton;
} // namespace Mtk::Widget

// Fourth page of the wizard: address and alias as chosen, a warning of what a join means, and the button that
// starts it. Holds no data and talks to no server; Widget fills the two values at each visit. No button has
// the focus before Tab is pressed: one Enter too many on the page before neither starts a join nor goes back.
class FinishSettingWidget : public QWidget
{
    Q_OBJECT

public:
    explicit FinishSettingWidget(QWidget *parent);

    // host:port of the server.
    void setServerIP(const QString &address);
    void setTermianlName(const QString &name);

    // Finish and back button together. Widget enables them again after a join that failed.
    void setButtonEnabled(bool enabled);

Q_SIGNALS:
    void sigJoinGroup();
    void sig_cancel_finish_setting();

public Q_SLOTS:
    // Disables both buttons and asks for the join, so that a second click starts nothing.
    void on_finish_setting();

private:
    void createInterface();
    void createConnections();
    static QHBoxLayout *createRow(const QString &captionText, Mtk::Widget::MLabel *value, const QFont &font);
    static Mtk::Widget::MFrame *createWarning(const QFont &font);
    QHBoxLayout *createButtons(const QFont &font);

    Mtk::Widget::MLabel *m_serverIpLabel = nullptr;
    Mtk::Widget::MLabel *m_terminalNameLabel = nullptr;
    Mtk::Widget::MSuggestButton *m_finishButton = nullptr;
    QPushButton *m_backButton = nullptr;
};
