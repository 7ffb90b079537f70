// SPDX-License-Identifier: Apache-2.0
#include "serverreply.h"

#include <QJsonDocument>

ServerReply::ServerReply(const QString &text)
    : ServerReply(text.toUtf8())
{
}

ServerReply::ServerReply(const QByteArray &json)
{
    QJsonParseError error{};
    m_object = QJsonDocument::fromJson(json, &error).object();
    m_isJson = error.error == QJsonParseError::NoError;
}

bool ServerReply::isGranted() const
{
    return isSuccess() && data().value(QStringLiteral("result")).toBool(false);
}

std::optional<QString> ServerReply::failure(int statusCode, const char *noReply, const char *badRequest) const
{
    if (statusCode == 0 || !m_isJson)
        return QString::fromLocal8Bit(noReply);
    if (statusCode == 400 && badRequest != nullptr)
        return QString::fromLocal8Bit(badRequest);
    if (statusCode == 200 && code() == 0)
        return std::nullopt;
    return message();
}
