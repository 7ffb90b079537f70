// SPDX-License-Identifier: Apache-2.0
// The D-Bus services that the program calls: are they there, or would the bus start them?
#include "collectors.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QFile>
#include <QStringList>

namespace {

constexpr int kLimitMs = 5000;

struct Service
{
    QDBusConnection::BusType bus;
    const char *name;
};

constexpr Service kServices[] = {
    {QDBusConnection::SystemBus, "com.morvek.vesk.veskg"},
    {QDBusConnection::SystemBus, "com.morvek.vesk.iam"},
    {QDBusConnection::SystemBus, "org.freedesktop.login1"},
    {QDBusConnection::SessionBus, "com.morvek.daemon.Network"},
};

// Names on a bus.
struct Names
{
    bool isKnown = false;
    QStringList present;
    QStringList activatable;
};

std::optional<QStringList> ask(const QDBusConnection &bus, const char *method)
{
    const QString daemon = QStringLiteral("org.freedesktop.DBus");
    const QDBusMessage reply =
        bus.call(QDBusMessage::createMethodCall(daemon, QStringLiteral("/org/freedesktop/DBus"), daemon,
                                                QLatin1String(method)),
                 QDBus::Block, kLimitMs);
    if (reply.type() != QDBusMessage::ReplyMessage)
        return std::nullopt;
    return reply.arguments().value(0).toStringList();
}

// Without an address the bus library might start a bus of its own.
bool hasSession()
{
    const QString runtime = qEnvironmentVariable("XDG_RUNTIME_DIR");
    return !qEnvironmentVariableIsEmpty("DBUS_SESSION_BUS_ADDRESS") ||
           (!runtime.isEmpty() && QFile::exists(runtime + QStringLiteral("/bus")));
}

Names namesOn(QDBusConnection::BusType type)
{
    if (type == QDBusConnection::SessionBus && !hasSession())
        return {};
    const QString connection = QStringLiteral("vesk-status-%1").arg(type);
    Names names;
    const QDBusConnection bus = QDBusConnection::connectToBus(type, connection);
    if (bus.isConnected()) {
        const auto present = ask(bus, "ListNames");
        const auto activatable = ask(bus, "ListActivatableNames");
        names = {present && activatable, present.value_or(QStringList()),
                 activatable.value_or(QStringList())};
    }
    QDBusConnection::disconnectFromBus(connection);
    return names;
}

Finding serviceFinding(const Service &service, const Names &names)
{
    const QString name = QLatin1String(service.name);
    const QString key = QStringLiteral("service:") + name;
    if (!names.isKnown && service.bus == QDBusConnection::SessionBus)
        return Finding::none(key, QJsonValue::Null, Text::tr("this user has no session bus here"));
    if (!names.isKnown)
        return Finding::unknown(key, Text::tr("the system bus cannot be reached"),
                                QStringLiteral("systemctl status dbus"));
    if (names.present.contains(name))
        return Finding::ok(key, QStringLiteral("present"), Text::tr("is there"));
    if (names.activatable.contains(name))
        return Finding::ok(key, QStringLiteral("activatable"), Text::tr("is started when it is called"));
    const QString absent = QStringLiteral("absent");
    // The desktop starts it; a session without one, of an administrator from afar, says nothing of the
    // desktop.
    if (service.bus == QDBusConnection::SessionBus)
        return Finding::none(key, absent, Text::tr("is not on the bus of this session"));
    return Finding::fault(key, absent, Text::tr("is not on the bus"),
                          Text::tr("install its package, or check its status with systemctl"));
}

} // namespace

Findings serviceFindings()
{
    const Names system = namesOn(QDBusConnection::SystemBus);
    const Names session = namesOn(QDBusConnection::SessionBus);
    Findings findings;
    for (const Service &service : kServices)
        findings += serviceFinding(service, service.bus == QDBusConnection::SystemBus ? system : session);
    return findings;
}
