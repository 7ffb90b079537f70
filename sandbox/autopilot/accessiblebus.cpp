// SPDX-License-Identifier: Apache-2.0
#include "accessiblebus.h"

#include "waitfor.h"

#include <QDBusArgument>
#include <QDBusConnectionInterface>
#include <QDBusError>
#include <QDBusObjectPath>
#include <QDBusVariant>
#include <QUuid>

namespace sandbox {

namespace {

const QString kAccessible = QStringLiteral("org.a11y.atspi.Accessible");
const QString kProperties = QStringLiteral("org.freedesktop.DBus.Properties");

} // namespace

static const QDBusArgument &operator>>(const QDBusArgument &argument, ObjectRef &object)
{
    QDBusObjectPath path;
    argument.beginStructure();
    argument >> object.service >> path;
    argument.endStructure();
    object.path = path.path();
    return argument;
}

AccessibleBus::AccessibleBus(const QString &address, int limitMs)
    : m_bus(QDBusConnection::connectToBus(address, QUuid::createUuid().toString()))
    , m_limitMs(limitMs)
{
    if (!m_bus.isConnected())
        throw Error(QStringLiteral("no bus at \"%1\": %2").arg(address, m_bus.lastError().message()));
    // Qt's thread for D-Bus enters the name of a new connection into a list that calls read without a lock.
    // The second exchange begins after that.
    exchange();
    exchange();
}

AccessibleBus::~AccessibleBus()
{
    // Qt's thread for D-Bus may not have let go of the last answer yet; where the process ends now, it is
    // lost. One more exchange gives it the time.
    exchange();
    QDBusConnection::disconnectFromBus(m_bus.name());
}

void AccessibleBus::exchange() const
{
    send({QStringLiteral("org.freedesktop.DBus"), QStringLiteral("/org/freedesktop/DBus")},
         QStringLiteral("org.freedesktop.DBus"), QStringLiteral("GetId"), {}, m_limitMs);
}

QString AccessibleBus::switchOn() const
{
    const ObjectRef launcher{QStringLiteral("org.a11y.Bus"), QStringLiteral("/org/a11y/bus")};
    call(launcher, kProperties, QStringLiteral("Set"),
         {QStringLiteral("org.a11y.Status"), QStringLiteral("IsEnabled"),
          QVariant::fromValue(QDBusVariant(true))});
    return call(launcher, QStringLiteral("org.a11y.Bus"), QStringLiteral("GetAddress")).toString();
}

QVariant AccessibleBus::call(const ObjectRef &object, const QString &interface, const QString &method,
                             const QVariantList &arguments) const
{
    const QDBusMessage reply = send(object, interface, method, arguments, m_limitMs);
    if (reply.type() != QDBusMessage::ReplyMessage)
        throw Vanished(QStringLiteral("no answer to %1 of %2 %3: %4")
                           .arg(method, object.service, object.path, reply.errorMessage()));
    return reply.arguments().value(0);
}

QVariant AccessibleBus::property(const ObjectRef &object, const QString &interface, const QString &name) const
{
    return call(object, kProperties, QStringLiteral("Get"), {interface, name})
        .value<QDBusVariant>()
        .variant();
}

QList<ObjectRef> AccessibleBus::children(const ObjectRef &object) const
{
    return qdbus_cast<QList<ObjectRef>>(call(object, kAccessible, QStringLiteral("GetChildren")));
}

QString AccessibleBus::name(const ObjectRef &object) const
{
    return property(object, kAccessible, QStringLiteral("Name")).toString();
}

QList<ObjectRef> AccessibleBus::programs(const QString &name) const
{
    QList<ObjectRef> found;
    for (const ObjectRef &each : children({QStringLiteral("org.a11y.atspi.Registry"),
                                           QStringLiteral("/org/a11y/atspi/accessible/root")})) {
        if (this->name(each) == name)
            found.append(each);
    }
    return found;
}

QDBusMessage AccessibleBus::send(const ObjectRef &object, const QString &interface, const QString &method,
                                 const QVariantList &arguments, int limitMs) const
{
    QDBusMessage request = QDBusMessage::createMethodCall(object.service, object.path, interface, method);
    request.setArguments(arguments);
    return m_bus.call(request, QDBus::Block, limitMs);
}

bool AccessibleBus::isAlive(const QString &service) const
{
    return m_bus.interface()->isServiceRegistered(service);
}

} // namespace sandbox
