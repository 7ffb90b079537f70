// SPDX-License-Identifier: Apache-2.0
// The start decision by rights and server, and the main window's share in leaving the domain.
#include "widget.h"

#include "commands.h"
#include "localselectwidget.h"
#include "logtext.h"
#include "pageparts.h"

#include "mtk/mdialog.h"

#include <QDebug>

using Mtk::Widget::MDialog;

namespace {

// A server's word that this terminal is managed, for a user with rights.
constexpr int kManagedStatus = 422;

} // namespace

bool Widget::isSudoUser()
{
    const QString identity = commands::userIdentity();
    return identity.contains(QLatin1String("sudo")) && identity.contains(QLatin1String("vesk"));
}

void Widget::initRelieveControlUI()
{
    const bool mayLeave = isSudoUser();
    if (m_closeGuard != nullptr) {
        m_closeGuard->show();
        return;
    }
    m_closeGuard = new whetherCloseGuard(m_contentWidget, mayLeave);
    connect(m_closeGuard, &whetherCloseGuard::sigClose, this, &Widget::onExit);
    connect(m_closeGuard, &whetherCloseGuard::sigRemove, this, &Widget::onRemoveFromControl);
    connect(m_closeGuard, &whetherCloseGuard::sigStartRemove, this, &Widget::onStartRemove);
    m_closeGuard->setFixedSize(pageparts::kPanelSize);
    fitTo(m_closeGuard);
    m_closeGuard->show();
}

void Widget::onTerminalParse(ERequestState state, int nCode, QString strMessage)
{
    qDebug() << "nCode:" << nCode << ":strMessage:" << vesk::base::logText(strMessage);
    if (state != RequestTerminalState)
        return;

    const bool mayLeave = isSudoUser();
    if (!mayLeave && nCode == 200) {
        if (strMessage == QLatin1String("join"))
            createInitWidget();
        else
            initRelieveControlUI();
        return;
    }
    hide();
    if (mayLeave && nCode == kManagedStatus) {
        initRelieveControlUI();
        return;
    }
    showStartRefusal(strMessage);
}

void Widget::showStartRefusal(const QString &text)
{
    MDialog dialog(this);
    connect(&dialog, &MDialog::closed, this, &Widget::onExit);
    pageparts::setMessage(dialog, text, tr("确定"));
    const int pressed = dialog.exec();
    qDebug() << "nreturns" << pressed;
    if (pressed == 0)
        onExit();
}

void Widget::onStartRemove()
{
    qDebug() << " m_bExit:" << (m_bExit ? "true" : "false");
    m_bExit = true;
}

void Widget::onRemoveFromControl(const int &nCode, const QString &strMessage)
{
    m_bExit = false;
    if (nCode == 200) {
        const int exitCode = commands::killOlderService();
        qDebug().noquote() << " nReturn:" << exitCode << ":cmd:" << commands::kKillOlderService;
        if (m_closeGuard != nullptr)
            m_closeGuard->removeSuccess();
    } else {
        commands::killOlderService();
        // Needs the pages of a join, which a run that began with the panel does not have: whoever emits
        // another code has to bring them, or a message path of its own.
        showMessageBox(strMessage);
    }
}
