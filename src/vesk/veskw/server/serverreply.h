// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QJsonObject>
#include <QString>

#include <optional>

// The envelope that every reply of the management server comes in: "code", 0 for success; "msg", the server's
// words for the user; "data", the payload. Read by the listeners of HttpRequest. Never fails: what is missing
// or of another type reads as its default, and a reply that is no JSON object as an empty one.
class ServerReply
{
public:
    explicit ServerReply(const QString &text);
    explicit ServerReply(const QByteArray &json);

    // Whether the text was JSON at all; an empty text is not.
    bool isJson() const { return m_isJson; }

    int code() const { return m_object.value(QStringLiteral("code")).toInt(0); }
    // "code" as it stands, for a comparison that a missing or odd value must not pass.
    QJsonValue rawCode() const { return m_object.value(QStringLiteral("code")); }
    QString message() const { return m_object.value(QStringLiteral("msg")).toString(); }
    QJsonObject data() const { return m_object.value(QStringLiteral("data")).toObject(); }

    // The server's yes: JSON and "code" 0; of a decision also "result" inside "data" true.
    bool isSuccess() const { return m_isJson && code() == 0; }
    bool isGranted() const;

    // What to tell the user, or nothing where the request has succeeded, which takes `statusCode` 200 and
    // "code" 0. `noReply` is the text for a request without a JSON reply, `badRequest` the one for status
    // 400, null where that is no case of its own; for all else there are the server's words, which may be
    // empty. Both texts are in the local 8-bit encoding.
    std::optional<QString> failure(int statusCode, const char *noReply,
                                   const char *badRequest = nullptr) const;

private:
    QJsonObject m_object;
    bool m_isJson = false;
};
