// SPDX-License-Identifier: Apache-2.0
#include "accessiblebus.h"

#include "announcement.h"
#include "trouble.h"

#include <QDBusArgument>
#include <QDBusConnectionInterface>
#include <QDBusError>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QDBusVariant>

namespace sandbox {

namespace {

constexpr int kCallTimeout = 2000; // milliseconds; a program at work answers later, so we ask again

const QString kConnectionName = QStringLiteral("vesk-autopilot-accessibility");
const QString kPropertiesInterface = QStringLiteral("org.freedesktop.DBus.Properties");
const QString kAccessibleInterface = QStringLiteral("org.a11y.atspi.Accessible");

QDBusConnection openAccessibilityBus()
{
    const QString address = announceReader();
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

void AccessibleBus::deliver(const ObjectRef &object, const QString &interface, const QString &method,
                            const QVariantList &arguments, const QDeadlineTimer &deadline) const
{
    QDBusMessage request = QDBusMessage::createMethodCall(object.service, object.path, interface, method);
    request.setArguments(arguments);
    m_bus.call(request, QDBus::Block, static_cast<int>(deadline.remainingTime()));
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
