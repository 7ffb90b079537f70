// SPDX-License-Identifier: Apache-2.0
#include "joinreply.h"

#include "regularfile.h"

#include <QStringList>

bool JoinReply::hasReadableFiles() const
{
    const auto isShort = [](const QString &base64) {
        return QByteArray::fromBase64(base64.toLocal8Bit()).size() <= vesk::base::regularfile::kMaxSize;
    };
    return isShort(key) && isShort(certificate);
}

JoinReply readJoinReply(const QJsonObject &data, const QString &enteredHost, const QString &enteredPort)
{
    const QStringList address =
        data.value(QStringLiteral("joined_domain")).toString().split(QLatin1Char(':'));
    return {data.value(QStringLiteral("key")).toString(), data.value(QStringLiteral("cert")).toString(),
            address.size() <= 2 ? address.first() : enteredHost,
            address.size() == 2 ? address.last() : enteredPort};
}
