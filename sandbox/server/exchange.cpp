// SPDX-License-Identifier: Apache-2.0
#include "server/exchange.h"

#include <QCryptographicHash>
#include <QDateTime>
#include <QJsonArray>
#include <QJsonDocument>
#include <QLocale>
#include <QUrlQuery>

#include <ostream> // Boost uses it without including it

#include <boost/beast/http/status.hpp>

namespace sandbox {

namespace {

constexpr int kMaxText = 2000;       // characters of a body in the journal
constexpr int kDripLength = 1000000; // bytes that a drip announces: longer than any client waits for
constexpr int kFloodLength = 1024 * 1024 * 1024; // bytes that a flood announces
constexpr int kBodyToCut = 64; // bytes that a truncated reply announces when it has none of its own

bool isSecret(const QString &key)
{
    return key.contains(QLatin1String("password"), Qt::CaseInsensitive);
}

bool isPem(const QString &key)
{
    return key == QLatin1String("key") || key == QLatin1String("cert") || key == QLatin1String("ca_cert");
}

QString hashOf(const QByteArray &content)
{
    constexpr int kDigits = 16;
    return QString::fromLatin1(
        QCryptographicHash::hash(content, QCryptographicHash::Sha256).toHex().left(kDigits));
}

// password: the right one.
QJsonValue masked(const QString &key, const QJsonValue &value, const QString &password)
{
    if (isSecret(key))
        return value == password ? QStringLiteral("***") : QStringLiteral("*** (wrong)");
    if (isPem(key) && value.isString())
        return QStringLiteral("<sha256 %1>").arg(hashOf(QByteArray::fromBase64(value.toString().toUtf8())));
    QJsonArray array = value.toArray();
    for (QJsonValueRef element : array)
        element = masked(key, element, password);
    QJsonObject object = value.toObject();
    for (auto entry = object.begin(); entry != object.end(); ++entry)
        entry.value() = masked(entry.key(), entry.value(), password);
    if (value.isArray())
        return array;
    return value.isObject() ? object : value;
}

QString shortened(const QString &text)
{
    return text.size() <= kMaxText ? text : text.left(kMaxText) + QStringLiteral("...");
}

// A body that is no JSON object cannot be masked, so only its length is told; `otherwise` may say more.
QString bodyText(const QByteArray &body, const QString &otherwise, const QString &password = {})
{
    const QJsonDocument document = QJsonDocument::fromJson(body);
    if (!document.isObject())
        return otherwise;
    const QJsonObject object = masked({}, document.object(), password).toObject();
    return shortened(QString::fromUtf8(QJsonDocument(object).toJson(QJsonDocument::Compact)));
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

// As HTTP writes a time.
QByteArray dateText()
{
    const QDateTime now = QDateTime::currentDateTimeUtc();
    return QLocale::c().toString(now, QStringLiteral("ddd, dd MMM yyyy hh:mm:ss 'GMT'")).toLatin1();
}

QByteArray headerOf(const Reply &reply, int length, bool keepAlive)
{
    const auto status = boost::beast::http::int_to_status(static_cast<unsigned>(reply.status));
    const auto reason = boost::beast::http::obsolete_reason(status);
    QByteArray header = "HTTP/1.1 " + QByteArray::number(reply.status) + ' ' +
                        QByteArray(reason.data(), static_cast<int>(reason.size())) + "\r\n";
    header += reply.isJson ? "Content-Type: application/json; charset=utf-8\r\n"
                           : "Content-Type: text/html; charset=utf-8\r\n";
    header += "Date: " + dateText() + "\r\n";
    header += "Content-Length: " + QByteArray::number(length) + "\r\n";
    if (!reply.allow.isEmpty())
        header += "Allow: " + reply.allow.toLatin1() + "\r\n";
    if (!reply.location.isEmpty())
        header += "Location: " + reply.location.toLatin1() + "\r\n";
    header += keepAlive ? "Cache-Control: no-store\r\n\r\n"
                        : "Cache-Control: no-store\r\nConnection: close\r\n\r\n";
    return header;
}

} // namespace

QByteArray envelope(int code, const QString &words, const QJsonObject &data)
{
    const QJsonObject object = {
        {QStringLiteral("code"), code}, {QStringLiteral("msg"), words}, {QStringLiteral("data"), data}};
    return QJsonDocument(object).toJson(QJsonDocument::Compact);
}

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

QByteArray wireOf(const Answer &answer, bool keepAlive)
{
    const QByteArray &body = answer.reply.body;
    const auto header = [&](int length) {
        return headerOf(answer.reply, length, keepAlive);
    };
    switch (answer.fault) {
    case Fault::None:
        return header(body.size()) + body;
    case Fault::HalfHeader:
        return header(body.size()).left(header(body.size()).size() / 2);
    case Fault::Truncate:
        return header(body.isEmpty() ? kBodyToCut : body.size()) + body.left(body.size() / 2);
    case Fault::Drip:
        return header(kDripLength) + body;
    case Fault::Flood:
        return header(kFloodLength) + body;
    case Fault::Garbage:
        return QByteArray::fromHex("00ff15c3") + "this is no answer\r\n\r\n";
    case Fault::CloseBeforeReply:
    case Fault::Reset:
        break;
    }
    return {};
}

QString journalText(const Request &request, const QString &password)
{
    QString text = QStringLiteral("request %1 %2 from %3 to %4")
                       .arg(request.method, targetText(request.target), request.peerAddress, request.host);
    if (!request.certificateName.isEmpty())
        text += QStringLiteral(" client certificate ") + request.certificateName;
    if (!request.body.isEmpty()) {
        const QString length = QStringLiteral("<%1 bytes, no JSON object>").arg(request.body.size());
        text += QLatin1Char(' ') + bodyText(request.body, length, password);
    }
    return text;
}

QString journalText(const Request &request, const Answer &answer)
{
    const QString to =
        QStringLiteral(" to %1 %2").arg(request.method, request.target.path(QUrl::FullyEncoded));
    if (answer.fault != Fault::None)
        return QStringLiteral("fault ") + wordOf(answer.fault) + to;
    const QString plain = shortened(QString::fromUtf8(answer.reply.body).simplified());
    const QString body = bodyText(answer.reply.body, plain);
    return QStringLiteral("reply %1").arg(answer.reply.status) +
           (body.isEmpty() ? body : QLatin1Char(' ') + body) + to;
}

} // namespace sandbox
