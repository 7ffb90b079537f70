// SPDX-License-Identifier: Apache-2.0
// The run of a join: the members of Widget between the summary page and the success window. Local steps come
// first, then the server; nothing is undone when a step fails, and the user may start over from the summary
// page.
#include "widget.h"

#include "commands.h"
#include "dbusservices.h"
#include "desktopmodule.h"
#include "fileconfig.h"
#include "finishsettingwidget.h"
#include "httprequest.h"
#include "joinreply.h"
#include "loginwidget.h"
#include "logtext.h"
#include "pageparts.h"
#include "serverreply.h"
#include "settingupwidget.h"
#include "wellknownpaths.h"

#include "mtk/mdialog.h"

#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QLabel>

#include <QDebug>

using Mtk::Widget::MDialog;

void Widget::domainConfig(QString operation)
{
    if (desktopChanges().hasAutoLoginSwitch())
        commands::hideLoginSwitches();
    m_settingUpWidget->setProgressValue(40);

    const QDBusPendingCall call = dbusservices::joinDomain(this, operation);
    m_settingUpWidget->setProgressValue(50);
    auto *watcher = new QDBusPendingCallWatcher(call, this);
    // By signature: part of the interface.
    connect(watcher, SIGNAL(finished(QDBusPendingCallWatcher *)), this,
            SLOT(onCallFinishedSlot(QDBusPendingCallWatcher *)));
    m_settingUpWidget->setProgressValue(60);
}

void Widget::onCallFinishedSlot(QDBusPendingCallWatcher *call)
{
    m_settingUpWidget->setProgressValue(70);
    const QDBusPendingReply<int> reply = *call;
    if (reply.isError()) {
        qCritical().noquote() << "加域执行失败:" << vesk::base::logText(reply.error().message());
        showMessageBox(QStringLiteral("加域执行失败!"));
    } else {
        m_settingUpWidget->setProgressValue(80);
        qDebug() << "本地加域完成... " << reply.value();
        commands::enableUserServices();
        qInfo() << "systemctl --user enable vesks finish!";
        // onJoinFinished() runs inside this call.
        HttpRequest::GetInstance()->postJoinControl(m_loginWidget->userName());
        m_settingUpWidget->setProgressValue(100);
    }
    call->deleteLater();
}

void Widget::onJoinFinished(const int &statusCode, const QString &replyText)
{
    const char *const noReply = "域管服务配置失败，请重试";
    const ServerReply reply(replyText);
    const auto failure = reply.failure(statusCode, noReply, "服务器已有此机器,请联系管理员。");
    const FileConfig *config = FileConfig::GetInstance();
    const JoinReply join = readJoinReply(reply.data(), config->readDomainHost(), config->readDomainPort());
    if (failure) {
        showMessageBox(*failure);
    } else if (!join.hasReadableFiles() || !config->hasRoomFor(join.serverHost, join.serverPort)) {
        // The terminal would be joined and could not read, after the reboot, that it is.
        qWarning() << "the reply to the join is not used: a file made of it would be too long";
        showMessageBox(QString::fromLocal8Bit(noReply));
    } else {
        finishJoin(join);
    }
}

void Widget::finishJoin(const JoinReply &reply)
{
    qInfo() << "加域完成";
    auto *label = new QLabel(this);
    label->setText(QStringLiteral("已成功加入域管控,请重启电脑生效"));

    FileConfig *config = FileConfig::GetInstance();
    config->saveCert(reply.key, QString::fromUtf8(vesk::kTmpPrivateKeyPath));
    config->saveCert(reply.certificate, QString::fromUtf8(vesk::kTmpPublicKeyPath));
    config->setServerHost(reply.serverHost);
    config->setServerPort(reply.serverPort);
    config->setIsDomain(true);
    config->writeServerConfig();

    dbusservices::installStagedConfig(this);
    if (dbusservices::enableDomainLogin(true)) {
        createJoinSuccessWidget();
    } else {
        qCritical() << "加域：统一认证配置失败！";
        showMessageBox(QString::fromLocal8Bit("域管服务配置失败,请重试"));
    }
}

void Widget::showMessageBox(const QString &text)
{
    MDialog dialog(this);
    connect(&dialog, &MDialog::closed, this, &Widget::onExit);
    pageparts::setMessage(dialog, text, tr("确定"));
    dialog.exec();

    m_finishSettingWidget->setButtonEnabled(true);
    m_settingUpWidget->hide();
    onFinishSetting();
}
