// SPDX-License-Identifier: Apache-2.0
#include "networkservice.h"

#include "networkadaptor.h"

#include <QFile>
#include <QJsonDocument>

namespace sandbox {

namespace {

// "null" is how the daemon says that there is no connection.
QString connectionsIn(const QString &path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return QStringLiteral("null");
    const QJsonDocument connections = QJsonDocument::fromJson(file.readAll());
    return connections.isArray() ? QString::fromUtf8(connections.toJson(QJsonDocument::Compact))
                                 : QStringLiteral("null");
}

} // namespace

NetworkService::NetworkService(const StateFolder &state, const ServiceScript &script)
    : Service(state, script, QStringLiteral("com.morvek.daemon.Network"))
{
    new NetworkAdaptor(this);
}

bool NetworkService::publish(QDBusConnection bus)
{
    return bus.registerObject(QStringLiteral("/com/morvek/daemon/Network"), this);
}

QString NetworkService::GetActiveConnectionInfo()
{
    const QString call = QStringLiteral("GetActiveConnectionInfo()");
    if (!begin(QStringLiteral("GetActiveConnectionInfo"), call))
        return {};
    const std::optional<QString> scripted = now(QStringLiteral("GetActiveConnectionInfo")).reply;
    QString reply = scripted ? *scripted : connectionsIn(state().connections());
    note(call, reply);
    leave(QStringLiteral("GetActiveConnectionInfo"), reply);
    return reply;
}

} // namespace sandbox
