// SPDX-License-Identifier: Apache-2.0
#include "serverreply.h"

#include <QJsonDocument>

ServerReply::ServerReply(const QString &text)
{
    QJsonParseError error{};
    m_object = QJsonDocument::fromJson(text.toUtf8(), &error).object();
    m_isJson = error.error == QJsonParseError::NoError;
}

bool ServerReply::isGranted() const
{
    return m_isJson && code() == 0 && data().value(QStringLiteral("result")).toBool(false);
}
