// SPDX-License-Identifier: Apache-2.0
#include "accessiblecalls.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QRegularExpression>

namespace Mtk {

namespace {

// Of the bridge, which tells neither.
const QString kConnection = QStringLiteral("a11y");
const QString kRoot = QStringLiteral("/org/a11y/atspi/accessible");

// Fits no call: what the bridge takes for the write of a property, or for the read of one.
const QString kUnusable = QStringLiteral("-");

QString nameOf(const QString &interface, const QString &member)
{
    return interface + QLatin1Char('.') + member;
}

} // namespace

AccessibleCalls::AccessibleCalls()
    : m_interfaces({QStringLiteral("org.freedesktop.DBus.Properties")})
    , m_signatures({{QStringLiteral("org.freedesktop.DBus.Properties.Get"), QStringLiteral("ss")},
                    {QStringLiteral("org.freedesktop.DBus.Properties.Set"), QStringLiteral("ssv")},
                    {QStringLiteral("org.freedesktop.DBus.Properties.GetAll"), kUnusable},
                    {QStringLiteral("org.a11y.atspi.Application.SetId"), kUnusable},
                    {QStringLiteral("org.a11y.atspi.Value.SetCurrentValue"), kUnusable}})
{
    QAccessible::installActivationObserver(this);
}

AccessibleCalls::~AccessibleCalls()
{
    QAccessible::removeActivationObserver(this);
}

QString AccessibleCalls::introspect(const QString &path) const
{
    return m_bridge ? m_bridge->introspect(path) : QString();
}

bool AccessibleCalls::handleMessage(const QDBusMessage &message, const QDBusConnection &connection)
{
    if (!m_bridge)
        return false;
    if (isSound(message))
        return m_bridge->handleMessage(message, connection);
    return connection.send(message.createErrorReply(QDBusError::InvalidArgs,
                                                    QStringLiteral("These are not the arguments of %1")
                                                        .arg(nameOf(message.interface(), message.member()))));
}

// Queued, since the bridge may still be about to take its own place.
void AccessibleCalls::accessibilityActiveChanged(bool isActive)
{
    if (isActive)
        QMetaObject::invokeMethod(this, &AccessibleCalls::takePlace, Qt::QueuedConnection);
}

void AccessibleCalls::takePlace()
{
    QDBusConnection connection(kConnection);
    auto *bridge = qobject_cast<QDBusVirtualObject *>(connection.objectRegisteredAt(kRoot));
    if (bridge == nullptr || bridge == this)
        return;
    m_bridge = bridge;
    connection.unregisterObject(kRoot);
    connection.registerVirtualObject(kRoot, this, QDBusConnection::SubPath);
}

bool AccessibleCalls::isSound(const QDBusMessage &message)
{
    if (!m_interfaces.contains(message.interface()))
        learn(message.path());
    return message.signature() == m_signatures.value(nameOf(message.interface(), message.member()));
}

// What an object announces. Methods that no object announces have no arguments. No parser of XML reads it
// all: an end tag is missing in it.
void AccessibleCalls::learn(const QString &path)
{
    static const QRegularExpression tag(QStringLiteral(
        R"re(<(?:interface name="([^"]*)"|method name="([^"]*)"|arg direction="in" type="([^"]*)"))re"));
    const QString announced = m_bridge->introspect(path);
    QString interface;
    QString method;
    bool isNew = false;
    for (auto each = tag.globalMatch(announced); each.hasNext();) {
        const QRegularExpressionMatch match = each.next();
        if (!match.capturedRef(1).isEmpty()) {
            interface = match.captured(1);
            isNew = !m_interfaces.contains(interface);
            m_interfaces.insert(interface);
        } else if (!match.capturedRef(2).isEmpty()) {
            method = nameOf(interface, match.captured(2));
        } else if (isNew) {
            m_signatures[method] += match.captured(3);
        }
    }
}

} // namespace Mtk
