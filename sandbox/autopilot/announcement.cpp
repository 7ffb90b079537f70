// SPDX-License-Identifier: Apache-2.0
#include "announcement.h"

#include "trouble.h"

#include <QDBusConnection>
#include <QDBusError>
#include <QDBusMessage>
#include <QDBusVariant>

namespace sandbox {

namespace {

constexpr int kActivationTimeout = 10000; // milliseconds; the launcher of the bus may have to be started

QDBusMessage request(const QString &interface, const QString &method)
{
    return QDBusMessage::createMethodCall(QStringLiteral("org.a11y.Bus"), QStringLiteral("/org/a11y/bus"),
                                          interface, method);
}

QDBusMessage ask(const QDBusMessage &question)
{
    const QDBusConnection session = QDBusConnection::sessionBus();
    if (!session.isConnected())
        throw Trouble(QStringLiteral("no session bus: %1").arg(session.lastError().message()));
    QDBusMessage reply = session.call(question, QDBus::Block, kActivationTimeout);
    if (reply.type() != QDBusMessage::ReplyMessage) {
        throw Trouble(
            QStringLiteral("no accessibility bus: org.a11y.Bus on the session bus does not answer (%1)")
                .arg(reply.errorMessage()));
    }
    return reply;
}

} // namespace

QString announceReader()
{
    QDBusMessage enable = request(QStringLiteral("org.freedesktop.DBus.Properties"), QStringLiteral("Set"));
    enable.setArguments({QStringLiteral("org.a11y.Status"), QStringLiteral("IsEnabled"),
                         QVariant::fromValue(QDBusVariant(true))});
    ask(enable);
    return ask(request(QStringLiteral("org.a11y.Bus"), QStringLiteral("GetAddress")))
        .arguments()
        .value(0)
        .toString();
}

} // namespace sandbox
