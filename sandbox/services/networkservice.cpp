// SPDX-License-Identifier: Apache-2.0
#include "methodservices.h"

#include "journal/smallfile.h"
#include "networkadaptor.h"

#include <QJsonDocument>

namespace sandbox {

namespace {

// "null" is how the daemon says that there is no connection.
QString connectionsIn(const QString &path)
{
    const QJsonDocument connections = QJsonDocument::fromJson(smallfile::read(path).value_or(""));
    return connections.isArray() ? QString::fromUtf8(connections.toJson(QJsonDocument::Compact))
                                 : QStringLiteral("null");
}

} // namespace

NetworkService::NetworkService(const StateDirectory &state, const QJsonObject &script)
    : Service(state, script, QStringLiteral("com.morvek.daemon.Network"))
{
    new NetworkAdaptor(this);
}

QString NetworkService::GetActiveConnectionInfo()
{
    const QString call = QStringLiteral("GetActiveConnectionInfo()");
    if (!begin(QStringLiteral("GetActiveConnectionInfo"), call))
        return {};
    QString reply = now(QStringLiteral("GetActiveConnectionInfo"))
                        .value(QLatin1String("reply"))
                        .toString(connectionsIn(state().connections()));
    note(call, reply);
    leave(QStringLiteral("GetActiveConnectionInfo"), reply);
    return reply;
}

} // namespace sandbox
