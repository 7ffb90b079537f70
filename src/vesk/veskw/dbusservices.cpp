// SPDX-License-Identifier: Apache-2.0
#include "dbusservices.h"

#include <QDebug>

namespace dbusservices {

QDBusInterface networkDaemon()
{
    return QDBusInterface(QStringLiteral("com.morvek.daemon.Network"),
                          QStringLiteral("/com/morvek/daemon/Network"),
                          QStringLiteral("com.morvek.daemon.Network"), QDBusConnection::sessionBus());
}

QDBusInterface veskg(QObject *parent)
{
    return QDBusInterface(QStringLiteral("com.morvek.vesk.veskg"), QStringLiteral("/com/morvek/vesk/veskg"),
                          QStringLiteral("com.morvek.vesk.veskg"), QDBusConnection::systemBus(), parent);
}

QDBusPendingCall startDomainConfig(QDBusInterface *veskg, const QString &operation)
{
    if (!veskg->connection().isConnected())
        return QDBusPendingCall::fromError(
            QDBusError(QDBusError::Disconnected, QStringLiteral("the system bus is not there")));
    return veskg->asyncCall(QStringLiteral("onDomainConfig"), operation);
}

QDBusInterface iam()
{
    return QDBusInterface(QStringLiteral("com.morvek.vesk.iam"), QStringLiteral("/com/morvek/vesk/iam"),
                          QStringLiteral("com.morvek.vesk.iam"), QDBusConnection::systemBus());
}

void requestReboot()
{
    qInfo() << "reboot";
    auto *loginManager = new QDBusInterface(
        QStringLiteral("org.freedesktop.login1"), QStringLiteral("/org/freedesktop/login1"),
        QStringLiteral("org.freedesktop.login1.Manager"), QDBusConnection::systemBus());
    loginManager->call(QStringLiteral("Reboot"), true);
    loginManager->deleteLater();
}

} // namespace dbusservices
