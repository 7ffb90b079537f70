// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtk/mblureffectwidget.h"

#include <QSize>
#include <QString>

class FinishSettingWidget;
class LoginWidget;
class NewTerminalNameWidget;
class QDBusPendingCallWatcher;
class ServerConfigWidget;
class SettingUpWidget;
class whetherCloseGuard;
struct JoinReply;

namespace Mtk::Widget {
class MTitlebar;
} // namespace Mtk::Widget

// What an outside check of the terminal was about. Only the first has a meaning to Widget.
enum ERequestState {
    RequestTerminalState = 0,
};

// The one main window and the controller of the wizard: decides at construction what the run begins with,
// makes each page the first time it is needed, moves between pages when they signal, and runs the join. What
// the user enters lives in the pages and in FileConfig, never here.
//
// widget.cpp has the frame and the way through the pages, widget_join.cpp the run of a join, widget_leave.cpp
// the start decision and the main window's share in leaving.
class Widget : public Mtk::Widget::MBlurEffectWidget
{
    Q_OBJECT

public:
    explicit Widget(QWidget *parent);
    ~Widget() override;

public Q_SLOTS:
    void onServerSetting();
    void onUserLogin();
    void onNewTerminal();
    void onFinishSetting();
    void onOkJoinGroup();
    void onCancelFinishSetting();
    // Connected to nothing; shows the account page again.
    void onLocalSetting();
    void onLoginSetting();
    // A cancel on the progress page has no effect on the run.
    void onCancelSetting();
    void onExit();
    // Connected to nothing; back from the progress page to the summary.
    void onCancelJoinControl();
    // Connected to nothing; the start decision from a server's answer, with the user's rights taken into
    // account.
    void onTerminalParse(ERequestState state, int nCode, QString strMessage);
    void onRemoveFromControl(const int &nCode, const QString &strMessage);
    void onStartRemove();
    void onCallFinishedSlot(QDBusPendingCallWatcher *call);

protected:
    void closeEvent(QCloseEvent *event) override;

private:
    // Moves from one page to another, either of which may not exist yet.
    void showInsteadOf(QWidget *previous, QWidget *page, bool withIcon);
    // Gives the window the width of `page` and its height plus that of the titlebar.
    void fitTo(const QWidget *page);
    void showIcon(bool on);

    void createInitWidget();
    void createJoinSuccessWidget();
    void initRelieveControlUI();
    // Whether the present user may attempt to leave. Waits for the command "id", up to 30 s.
    bool isSudoUser();
    void showStartRefusal(const QString &text);

    void domainConfig(QString operation);
    void onJoinFinished(const int &statusCode, const QString &data);
    void finishJoin(const JoinReply &reply);
    // The failure dialog of a join, which also walks back to the summary page.
    void showMessageBox(const QString &text);

    ServerConfigWidget *m_serverConfigWidget = nullptr;
    QWidget *m_contentWidget = nullptr; // below the titlebar; parent of every page
    LoginWidget *m_loginWidget = nullptr;
    NewTerminalNameWidget *m_terminalNameWidget = nullptr;
    FinishSettingWidget *m_finishSettingWidget = nullptr;
    SettingUpWidget *m_settingUpWidget = nullptr;
    whetherCloseGuard *m_closeGuard = nullptr;
    QSize m_initialSize;  // invalid until the window has its first size
    bool m_bExit = false; // while true, the window must not close
    Mtk::Widget::MTitlebar *m_titlebar = nullptr;
};
