// SPDX-License-Identifier: Apache-2.0
#include "dbusservices.h"

#include <QDBusAbstractInterface>
#include <QDBusInterface>
#include <QDBusMessage>
#include <QDBusPendingCall>
#include <QDBusReply>

#include <QDebug>

namespace dbusservices {

namespace {

// Of a call that only asks. One that changes the machine has as long as the bus library gives it.
constexpr int kAskTimeoutMs = 5000;

// Makes calls without the introspection data of the service, which may be slow to come and slow to read.
class Proxy : public QDBusAbstractInterface
{
public:
    Proxy(const QString &service, const QString &path, const char *interface,
          const QDBusConnection &connection, QObject *parent = nullptr)
        : QDBusAbstractInterface(service, path, interface, connection, parent)
    {
    }
};

// The library's thread enters the name that a bus gives to a new connection into a list, without the lock
// under which a call to a service reads it. A second question is sent after that has happened.
void settle(const QDBusConnection &connection)
{
    const QString daemon = QStringLiteral("org.freedesktop.DBus");
    const QDBusMessage question = QDBusMessage::createMethodCall(
        daemon, QStringLiteral("/org/freedesktop/DBus"), daemon, QStringLiteral("GetId"));
    if (connection.call(question, QDBus::Block, kAskTimeoutMs).type() == QDBusMessage::ReplyMessage)
        connection.call(question, QDBus::Block, kAskTimeoutMs);
}

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
    connection = QDBusConnection::connectToBus(type, name);
    settle(connection);
    return connection;
}

Proxy veskg(QObject *parent)
{
    return Proxy(QStringLiteral("com.morvek.vesk.veskg"), QStringLiteral("/com/morvek/vesk/veskg"),
                 "com.morvek.vesk.veskg", bus(QDBusConnection::SystemBus), parent);
}

void configureDomain(QObject *parent, const QString &operation)
{
    Proxy service = veskg(parent);
    service.call(QStringLiteral("onDomainConfig"), operation);
}

} // namespace

std::optional<QString> activeConnections()
{
    Proxy daemon(QStringLiteral("com.morvek.daemon.Network"), QStringLiteral("/com/morvek/daemon/Network"),
                 "com.morvek.daemon.Network", bus(QDBusConnection::SessionBus));
    daemon.setTimeout(kAskTimeoutMs);
    const QDBusReply<QString> reply = daemon.call(QStringLiteral("GetActiveConnectionInfo"));
    if (!reply.isValid())
        return std::nullopt;
    return reply.value();
}

QDBusPendingCall joinDomain(QObject *parent, const QString &operation)
{
    auto *service = new Proxy(veskg(parent));
    // The bus library alone would never report on a call without a bus.
    if (!service->connection().isConnected())
        return QDBusPendingCall::fromError(
            QDBusError(QDBusError::Disconnected, QStringLiteral("the system bus is not there")));
    return service->asyncCall(QStringLiteral("onDomainConfig"), operation);
}

void installStagedConfig(QObject *parent)
{
    configureDomain(parent, QStringLiteral("copyConfig"));
}

void leaveDomain(QObject *parent)
{
    configureDomain(parent, QStringLiteral("remove"));
}

bool enableDomainLogin(bool enabled)
{
    // The property is found in the introspection data.
    QDBusInterface identity(QStringLiteral("com.morvek.vesk.iam"), QStringLiteral("/com/morvek/vesk/iam"),
                            QStringLiteral("com.morvek.vesk.iam"), bus(QDBusConnection::SystemBus));
    return identity.setProperty("Enable", enabled);
}

void requestReboot()
{
    qInfo() << "reboot";
    Proxy loginManager(QStringLiteral("org.freedesktop.login1"), QStringLiteral("/org/freedesktop/login1"),
                       "org.freedesktop.login1.Manager", bus(QDBusConnection::SystemBus));
    loginManager.call(QStringLiteral("Reboot"), true);
}

} // namespace dbusservices
