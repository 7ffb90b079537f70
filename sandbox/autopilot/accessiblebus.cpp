// SPDX-License-Identifier: Apache-2.0
#include "accessiblebus.h"

#include "trouble.h"

#include <QDBusArgument>
#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QDBusVariant>

namespace sandbox {

namespace {

constexpr int kCallTimeout = 2000; // milliseconds; a program at work answers later, so we ask again
constexpr int kActivationTimeout =
    10000; // milliseconds; the launcher of the accessibility bus starts on demand

const QString kConnectionName = QStringLiteral("vesk-autopilot-accessibility");
const QString kPropertiesInterface = QStringLiteral("org.freedesktop.DBus.Properties");
const QString kAccessibleInterface = QStringLiteral("org.a11y.atspi.Accessible");

QDBusMessage busCall(const QString &interface, const QString &method)
{
    return QDBusMessage::createMethodCall(QStringLiteral("org.a11y.Bus"), QStringLiteral("/org/a11y/bus"),
                                          interface, method);
}

QDBusConnection sessionBus()
{
    QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.isConnected())
        throw Trouble(QStringLiteral("no session bus: %1").arg(bus.lastError().message()));
    return bus;
}

QDBusMessage askLauncher(const QDBusConnection &session, const QDBusMessage &request)
{
    const QDBusMessage reply = session.call(request, QDBus::Block, kActivationTimeout);
    if (reply.type() != QDBusMessage::ReplyMessage) {
        throw Trouble(
            QStringLiteral("no accessibility bus: org.a11y.Bus on the session bus does not answer (%1)")
                .arg(reply.errorMessage()));
    }
    return reply;
}

// A toolkit publishes its tree only while somebody has said that there is a reader for it.
void announceReader(const QDBusConnection &session)
{
    QDBusMessage request = busCall(kPropertiesInterface, QStringLiteral("Set"));
    request.setArguments({QStringLiteral("org.a11y.Status"), QStringLiteral("IsEnabled"),
                          QVariant::fromValue(QDBusVariant(true))});
    askLauncher(session, request);
}

QDBusConnection openAccessibilityBus()
{
    const QDBusConnection session = sessionBus();
    announceReader(session);
    const QString address =
        askLauncher(session, busCall(QStringLiteral("org.a11y.Bus"), QStringLiteral("GetAddress")))
            .arguments()
            .value(0)
            .toString();
    QDBusConnection bus = QDBusConnection::connectToBus(address, kConnectionName);
    if (!bus.isConnected()) {
        throw Trouble(QStringLiteral("no accessibility bus: nobody listens at \"%1\" (%2)")
                          .arg(address, bus.lastError().message()));
    }
    return bus;
}

} // namespace

AccessibleBus::AccessibleBus()
    : m_bus(openAccessibilityBus())
{
}

AccessibleBus::~AccessibleBus()
{
    QDBusConnection::disconnectFromBus(kConnectionName);
}

QVariantList AccessibleBus::call(const ObjectRef &object, const QString &interface, const QString &method,
                                 const QVariantList &arguments) const
{
    QDBusMessage request = QDBusMessage::createMethodCall(object.service, object.path, interface, method);
    request.setArguments(arguments);
    const QDBusMessage reply = m_bus.call(request, QDBus::Block, kCallTimeout);
    if (reply.type() != QDBusMessage::ReplyMessage || reply.arguments().isEmpty())
        throw Vanished(QStringLiteral("%1 of %2: %3").arg(method, object.path, reply.errorMessage()));
    return reply.arguments();
}

QVariant AccessibleBus::property(const ObjectRef &object, const QString &interface, const QString &name) const
{
    const QVariantList reply = call(object, kPropertiesInterface, QStringLiteral("Get"), {interface, name});
    return reply.first().value<QDBusVariant>().variant();
}

std::vector<ObjectRef> AccessibleBus::children(const ObjectRef &object) const
{
    const auto reply =
        call(object, kAccessibleInterface, QStringLiteral("GetChildren")).first().value<QDBusArgument>();
    std::vector<ObjectRef> found;
    reply.beginArray();
    while (!reply.atEnd()) {
        ObjectRef child;
        QDBusObjectPath path;
        reply.beginStructure();
        reply >> child.service >> path;
        reply.endStructure();
        child.path = path.path();
        found.push_back(child);
    }
    reply.endArray();
    return found;
}

void AccessibleBus::send(const ObjectRef &object, const QString &interface, const QString &method,
                         const QVariantList &arguments) const
{
    QDBusMessage request = QDBusMessage::createMethodCall(object.service, object.path, interface, method);
    request.setArguments(arguments);
    m_bus.asyncCall(request);
}

bool AccessibleBus::isAlive(const QString &service) const
{
    return m_bus.interface()->isServiceRegistered(service);
}

std::vector<ObjectRef> AccessibleBus::applications() const
{
    return children(
        {QStringLiteral("org.a11y.atspi.Registry"), QStringLiteral("/org/a11y/atspi/accessible/root")});
}

} // namespace sandbox
