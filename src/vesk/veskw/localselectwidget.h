// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QPointer>
#include <QString>
#include <QWidget>

class QBoxLayout;
class QFont;
class QPushButton;

namespace Mtk::Widget {
class MLabel;
class MSpinner;
class MSuggestButton;
} // namespace Mtk::Widget

namespace mcc::widgets {
class LineEditWidget;
} // namespace mcc::widgets

// The leave panel: the whole user interface of taking a joined terminal out of its domain. Widget shows it in
// place of the wizard. It has three looks, offer, working and removed, in this order and never back. A
// removal that stops half way leaves the panel in its working look and the window closed to every exit:
// nothing is undone.
//
// localselectwidget.cpp has the panel and the authorisation, localselectwidget_removal.cpp the removal and
// the local restore.
class whetherCloseGuard : public QWidget
{
    Q_OBJECT

public:
    // isSudoUser: whether the present user may attempt to leave.
    whetherCloseGuard(QWidget *parent, bool isSudoUser);

    // The removed look. Called by Widget when the server has confirmed.
    void removeSuccess();

Q_SIGNALS:
    void sigClose();
    // Never emitted; part of the class's interface.
    void sigCancelgroupFinished();
    // The server has removed the terminal. nCode is 200, strMessage the reply.
    void sigRemove(const int &nCode, const QString &strMessage);
    // The local restore begins; from here on the window must not close.
    void sigStartRemove();

public Q_SLOTS:
    // Nothing happens while the administrator dialog is open.
    void closeGuardCliked();
    void closeCliked();
    // Connected to nothing. 0 when `data` is no JSON, 1 otherwise, whatever its "code" says.
    int analyseData(QByteArray *data);
    void on_reboot();
    void onQuitInfo(const int &statusCode, const QString &data);
    // Connected to nothing.
    void onFinishedRemove();
    // Does nothing: the state reply is taken from the call's result.
    void onMacheineCheck(const int &statusCode, const QString &data);
    // index: 0 for cancel, 1 for authorise. The rows of the dialog still exist; without them nothing happens.
    void onbuttonClicked(int index, const QString &text);

private:
    void createInterface();
    void createConnections();
    QBoxLayout *createButtons(const QFont &font);
    // Shows the sentence and has a screen reader say it, with the window and with each button.
    void say(const QString &sentence);
    void waitProgressbar();
    void showMessageBox(const QString &text);

    void askForAdministrator();
    static mcc::widgets::LineEditWidget *createRow(const QString &title, bool isPassword);

    void remove();
    // Switches to the working look; in spite of its name it restores nothing.
    void restoreClient();
    void restoreConfig();

    Mtk::Widget::MSuggestButton *m_confirmButton = nullptr;
    QPushButton *m_cancelButton = nullptr;
    Mtk::Widget::MSpinner *m_spinner = nullptr;
    Mtk::Widget::MLabel *m_tipLabel = nullptr;
    bool m_bSudoUser;
    QPointer<mcc::widgets::LineEditWidget> m_adminNameEdit; // of the open dialog, null without one
    QPointer<mcc::widgets::LineEditWidget> m_adminPwdEdit;  // of the open dialog, null without one
    QString m_adminName;
    QString m_adminPwd;
};
