// SPDX-License-Identifier: Apache-2.0
#include "joinreply.h"

#include <QStringList>

JoinReply readJoinReply(const QJsonObject &data, const QString &enteredHost, const QString &enteredPort)
{
    const QStringList address =
        data.value(QStringLiteral("joined_domain")).toString().split(QLatin1Char(':'));
    return {data.value(QStringLiteral("key")).toString(), data.value(QStringLiteral("cert")).toString(),
            address.size() <= 2 ? address.first() : enteredHost,
            address.size() == 2 ? address.last() : enteredPort};
}
