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
#include "loginwidget.h"
#include "pageparts.h"
#include "serverreply.h"
#include "settingupwidget.h"
#include "wellknownpaths.h"

#include "mtk/mdialog.h"

#include <QDBusMessage>
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

    auto *service = new QDBusInterface(dbusservices::veskg(this));
    const QDBusPendingCall call = dbusservices::startDomainConfig(service, operation);
    m_settingUpWidget->setProgressValue(50);
    auto *watcher = new QDBusPendingCallWatcher(call, this);
    connect(watcher, SIGNAL(finished(QDBusPendingCallWatcher *)), this,
            SLOT(onCallFinishedSlot(QDBusPendingCallWatcher *)));
    m_settingUpWidget->setProgressValue(60);
}

void Widget::onCallFinishedSlot(QDBusPendingCallWatcher *call)
{
    m_settingUpWidget->setProgressValue(70);
    const QDBusPendingReply<int> reply = *call;
    if (reply.isError()) {
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
    const ServerReply reply(replyText);
    if (statusCode == 0 || !reply.isJson())
        showMessageBox(QString::fromLocal8Bit("域管服务配置失败，请重试"));
    else if (statusCode == 400)
        showMessageBox(QString::fromLocal8Bit("服务器已有此机器,请联系管理员。"));
    else if (statusCode == 200 && reply.code() == 0)
        finishJoin(reply.data());
    else
        showMessageBox(reply.message());
}

void Widget::finishJoin(const QJsonObject &payload)
{
    qInfo() << "加域完成";
    auto *label = new QLabel(this);
    label->setText(QStringLiteral("已成功加入域管控,请重启电脑生效"));

    FileConfig *config = FileConfig::GetInstance();
    config->saveCert(payload.value(QStringLiteral("key")).toString(),
                     QString::fromUtf8(vesk::kTmpPrivateKeyPath));
    config->saveCert(payload.value(QStringLiteral("cert")).toString(),
                     QString::fromUtf8(vesk::kTmpPublicKeyPath));
    storeServerAddress(payload.value(QStringLiteral("joined_domain")).toString());
    config->setIsDomain(true);
    config->writeServerConfig();

    QDBusInterface service = dbusservices::veskg(this);
    const QDBusMessage answer = service.call(QStringLiteral("onDomainConfig"), QStringLiteral("copyConfig"));
    Q_UNUSED(answer)
    QDBusInterface identity = dbusservices::iam();
    if (identity.setProperty("Enable", true))
        createJoinSuccessWidget();
    else
        showMessageBox(QString::fromLocal8Bit("域管服务配置失败,请重试"));
}

// "joined_domain" is a host, or host:port; with more colons it is not understood, and the address that the
// user entered stays in use.
void Widget::storeServerAddress(const QString &joinedDomain)
{
    FileConfig *config = FileConfig::GetInstance();
    const QStringList parts = joinedDomain.split(QLatin1Char(':'));
    const bool isUnderstood = parts.size() <= 2;
    config->setServerHost(isUnderstood ? parts.first() : config->readDomainHost());
    config->setServerPort(parts.size() == 2 ? parts.last() : config->readDomainPort());
}

void Widget::showMessageBox(const QString &text)
{
    MDialog dialog(this);
    connect(&dialog, &MDialog::closed, this, &Widget::onExit);
    pageparts::dressMessage(dialog, text, tr("确定"));
    dialog.exec();

    m_finishSettingWidget->setButtonEnabled(true);
    m_settingUpWidget->hide();
    onFinishSetting();
}
