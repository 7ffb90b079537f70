// SPDX-License-Identifier: Apache-2.0
// The removal: the members of whetherCloseGuard between the click on authorise and the removed look. The
// local restore comes before the server hears of it, and no result of a local step stops the run but that of
// the identity service.
#include "localselectwidget.h"

#include "backupconfig.h"
#include "commands.h"
#include "dbusservices.h"
#include "desktopmodule.h"
#include "fileconfig.h"
#include "httprequest.h"
#include "serverreply.h"
#include "widgets/lineeditwidget.h"

#include "mtk/mlineedit.h"

#include <QDebug>

void whetherCloseGuard::onbuttonClicked(int index, const QString &text)
{
    Q_UNUSED(text)
    constexpr int kAuthorise = 1;
    if (!m_adminNameEdit || !m_adminPwdEdit)
        return;
    m_adminName = m_adminNameEdit->edit()->text();
    m_adminPwd = m_adminPwdEdit->edit()->text();
    if (index != kAuthorise)
        return;

    const ServerReply reply(HttpRequest::GetInstance()->postRemoveStatus(m_adminName, m_adminPwd));
    if (reply.isGranted())
        remove();
    else
        showMessageBox(reply.message());
}

void whetherCloseGuard::remove()
{
    restoreClient();
    restoreConfig();

    dbusservices::leaveDomain(this);
    if (!dbusservices::enableDomainLogin(false)) {
        qCritical() << "解域：统一认证配置失败！";
        showMessageBox(QStringLiteral("退域失败!"));
        return;
    }

    // onQuitInfo() has read the same reply, with the status before it, when the call returns.
    const ServerReply reply(HttpRequest::GetInstance()->postQuitControl(m_adminName));
    if (!reply.isJson())
        showMessageBox(QStringLiteral("解域：服务器返回错误！"));
    else if (reply.isGranted())
        qInfo() << "解域完成";
    else
        showMessageBox(reply.message());
}

void whetherCloseGuard::onQuitInfo(const int &statusCode, const QString &replyText)
{
    if (statusCode != 200) {
        showMessageBox(QString::fromLocal8Bit("网络异常，请稍后重试"));
        return;
    }
    const ServerReply reply(replyText);
    if (reply.isGranted())
        Q_EMIT sigRemove(statusCode, replyText);
    else
        showMessageBox(reply.message());
}

void whetherCloseGuard::restoreClient()
{
    Q_EMIT sigStartRemove();
    waitProgressbar();
}

void whetherCloseGuard::restoreConfig()
{
    desktopChanges().hideLoginSwitches();
    FileConfig::GetInstance()->setIsDomain(false);
    FileConfig::GetInstance()->writeServerConfig();

    desktopChanges().liftRestrictions(backupconfig::controlCenterList());
    commands::stopUserServices();
}
