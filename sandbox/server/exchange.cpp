// SPDX-License-Identifier: Apache-2.0
#include "server/exchange.h"

#include <QJsonArray>
#include <QJsonDocument>
#include <QUrlQuery>

namespace sandbox {

namespace {

constexpr int kLongestText = 2000; // characters of a body in the journal

QByteArray envelope(int code, const QString &words, const QJsonObject &data)
{
    const QJsonObject object = {
        {QStringLiteral("code"), code}, {QStringLiteral("msg"), words}, {QStringLiteral("data"), data}};
    return QJsonDocument(object).toJson(QJsonDocument::Compact);
}

bool isSecret(const QString &key)
{
    return key.contains(QLatin1String("password"), Qt::CaseInsensitive);
}

bool isKeyMaterial(const QString &key)
{
    return key == QLatin1String("key") || key == QLatin1String("cert") || key == QLatin1String("ca_cert");
}

QJsonObject masked(const QJsonObject &object);

QJsonValue masked(const QString &key, const QJsonValue &value)
{
    if (isSecret(key))
        return QStringLiteral("***");
    if (isKeyMaterial(key) && value.isString())
        return QStringLiteral("<%1 bytes>").arg(value.toString().toUtf8().size());
    if (value.isObject())
        return masked(value.toObject());
    if (value.isArray()) {
        QJsonArray array;
        const QJsonArray elements = value.toArray();
        for (const QJsonValue &element : elements)
            array += masked(key, element);
        return array;
    }
    return value;
}

QJsonObject masked(const QJsonObject &object)
{
    QJsonObject result;
    for (auto entry = object.begin(); entry != object.end(); ++entry)
        result.insert(entry.key(), masked(entry.key(), entry.value()));
    return result;
}

QString shortened(const QString &text)
{
    return text.size() <= kLongestText ? text : text.left(kLongestText) + QStringLiteral("...");
}

// A body that is no JSON object cannot be masked, so only its length is told; `otherwise` may say more.
QString bodyText(const QByteArray &body, const QString &otherwise)
{
    const QJsonDocument document = QJsonDocument::fromJson(body);
    if (!document.isObject())
        return otherwise;
    return shortened(
        QString::fromUtf8(QJsonDocument(masked(document.object())).toJson(QJsonDocument::Compact)));
}

QString targetText(const QUrl &target)
{
    QUrlQuery query(target);
    const auto items = query.queryItems(QUrl::FullyEncoded);
    QStringList texts;
    for (const auto &item : items)
        texts += item.first + QLatin1Char('=') + (isSecret(item.first) ? QStringLiteral("***") : item.second);
    const QString path = target.path(QUrl::FullyEncoded);
    return shortened(texts.isEmpty() ? path : path + QLatin1Char('?') + texts.join(QLatin1Char('&')));
}

QString faultName(Fault fault)
{
    switch (fault) {
    case Fault::CloseBeforeReply:
        return QStringLiteral("close-before-reply");
    case Fault::Reset:
        return QStringLiteral("reset");
    case Fault::HalfHeader:
        return QStringLiteral("half-header");
    case Fault::Truncate:
        return QStringLiteral("truncate");
    case Fault::Drip:
        return QStringLiteral("drip");
    case Fault::Garbage:
        return QStringLiteral("garbage");
    case Fault::Flood:
        return QStringLiteral("flood");
    case Fault::None:
        break;
    }
    return {};
}

} // namespace

Reply success(const QJsonObject &data)
{
    return {200, envelope(0, QString(), data)};
}

Reply refusal(const Refused &refused)
{
    QString words = QString::fromUtf8(refused.refusal.words);
    if (!refused.detail.isEmpty())
        words = words.arg(refused.detail);
    const QJsonObject data = {{QStringLiteral("result"), false}};
    return {refused.refusal.status, envelope(refused.refusal.code, words, data)};
}

QString journalText(const Request &request)
{
    QString text = QStringLiteral("request %1 %2 from %3")
                       .arg(request.method, targetText(request.target), request.peerAddress);
    if (!request.certificateName.isEmpty())
        text += QStringLiteral(" client certificate ") + request.certificateName;
    if (!request.body.isEmpty()) {
        const QString length = QStringLiteral("<%1 bytes, no JSON object>").arg(request.body.size());
        text += QLatin1Char(' ') + bodyText(request.body, length);
    }
    return text;
}

QString journalText(const Request &request, const Answer &answer)
{
    const QString to =
        QStringLiteral(" to %1 %2").arg(request.method, request.target.path(QUrl::FullyEncoded));
    if (answer.fault != Fault::None)
        return QStringLiteral("fault ") + faultName(answer.fault) + to;
    const QString plain = shortened(QString::fromUtf8(answer.reply.body).simplified());
    const QString body = bodyText(answer.reply.body, plain);
    return QStringLiteral("reply %1").arg(answer.reply.status) +
           (body.isEmpty() ? body : QLatin1Char(' ') + body) + to;
}

} // namespace sandbox
