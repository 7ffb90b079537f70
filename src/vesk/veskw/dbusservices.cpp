// SPDX-License-Identifier: Apache-2.0
#include "dbusservices.h"

#include <QDebug>

namespace dbusservices {

namespace {

// The library's own connections hold back what comes until the event loop runs: a call that is made before
// would wait for ever if the bus went away meanwhile. Nor do they come back when the bus does.
QDBusConnection bus(QDBusConnection::BusType type)
{
    const QString name =
        type == QDBusConnection::SystemBus ? QStringLiteral("veskw-system") : QStringLiteral("veskw-session");
    QDBusConnection connection(name);
    if (connection.isConnected())
        return connection;
    QDBusConnection::disconnectFromBus(name);
    return QDBusConnection::connectToBus(type, name);
}

} // namespace

QDBusInterface networkDaemon()
{
    return QDBusInterface(QStringLiteral("com.morvek.daemon.Network"),
                          QStringLiteral("/com/morvek/daemon/Network"),
                          QStringLiteral("com.morvek.daemon.Network"), bus(QDBusConnection::SessionBus));
}

QDBusInterface veskg(QObject *parent)
{
    return QDBusInterface(QStringLiteral("com.morvek.vesk.veskg"), QStringLiteral("/com/morvek/vesk/veskg"),
                          QStringLiteral("com.morvek.vesk.veskg"), bus(QDBusConnection::SystemBus), parent);
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
                          QStringLiteral("com.morvek.vesk.iam"), bus(QDBusConnection::SystemBus));
}

void requestReboot()
{
    qInfo() << "reboot";
    auto *loginManager = new QDBusInterface(
        QStringLiteral("org.freedesktop.login1"), QStringLiteral("/org/freedesktop/login1"),
        QStringLiteral("org.freedesktop.login1.Manager"), bus(QDBusConnection::SystemBus));
    loginManager->call(QStringLiteral("Reboot"), true);
    loginManager->deleteLater();
}

} // namespace dbusservices
