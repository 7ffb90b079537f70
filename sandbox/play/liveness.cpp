// SPDX-License-Identifier: Apache-2.0
#include "play/liveness.h"

#include <QDBusArgument>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QDBusVariant>

namespace sandbox {

namespace {

const QString kConnection = QStringLiteral("vesk-campaign-liveness");
const QString kAccessible = QStringLiteral("org.a11y.atspi.Accessible");
const QString kRoot = QStringLiteral("/org/a11y/atspi/accessible/root");

QVariant ask(const QDBusConnection &bus, const QString &service, const QString &interface,
             const QString &method, const QVariantList &arguments, int limitMs)
{
    QDBusMessage question = QDBusMessage::createMethodCall(service, kRoot, interface, method);
    question.setArguments(arguments);
    return bus.call(question, QDBus::Block, limitMs).arguments().value(0);
}

QStringList programsOn(const QDBusConnection &bus, int limitMs)
{
    const QVariant children = ask(bus, QStringLiteral("org.a11y.atspi.Registry"), kAccessible,
                                  QStringLiteral("GetChildren"), {}, limitMs);
    if (!children.canConvert<QDBusArgument>())
        return {};
    const auto reply = children.value<QDBusArgument>();
    QStringList services;
    reply.beginArray();
    while (!reply.atEnd()) {
        QString service;
        QDBusObjectPath path;
        reply.beginStructure();
        reply >> service >> path;
        reply.endStructure();
        services.append(service);
    }
    reply.endArray();
    return services;
}

bool hasName(const QDBusConnection &bus, const QString &service, const QString &program, int limitMs)
{
    const QVariant name = ask(bus, service, QStringLiteral("org.freedesktop.DBus.Properties"),
                              QStringLiteral("Get"), {kAccessible, QStringLiteral("Name")}, limitMs);
    return name.value<QDBusVariant>().variant().toString() == program;
}

} // namespace

bool isAnswering(const QString &busAddress, const QString &program, int limitMs)
{
    bool answers = false;
    {
        const QDBusConnection bus = QDBusConnection::connectToBus(busAddress, kConnection);
        for (const QString &service : programsOn(bus, limitMs))
            answers = answers || hasName(bus, service, program, limitMs);
    }
    QDBusConnection::disconnectFromBus(kConnection);
    return answers;
}

} // namespace sandbox
