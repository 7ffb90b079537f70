// SPDX-License-Identifier: Apache-2.0
#include "check.h"

#include "certificate.h"
#include "curlexchange.h"
#include "exitcodes.h"
#include "filecontent.h"
#include "pemcheck.h"
#include "pemfile.h"
#include "serverreply.h"
#include "transport.h"

#include <QDateTime>
#include <QRegularExpression>
#include <QUrl>
#include <QUrlQuery>

#include <curl/curl.h>

namespace {

using Reached = ExchangeTrace::Reached;

constexpr int kLimitMs = 2 * 60 * 1000;
constexpr qint64 kMaxClockDifference = 300; // seconds
constexpr int kMaxPort = 65535;
constexpr int kStatusOk = 200;
constexpr int kTerminalLimitCode = -500000;

QString key(const char *name)
{
    return QLatin1String(name);
}

// What is said of a certificate in a line about trust.
QString describe(const QByteArray &pem)
{
    const auto certificate = Certificate::read(pem);
    return certificate ? Text::tr("%1, SHA-256 %2").arg(certificate->subject, certificate->fingerprint)
                       : QString();
}

QString adviceOnTls(const ExchangeOutcome &outcome)
{
    if (outcome.source == ExchangeOutcome::FailureSource::Peer)
        return Text::tr(
                   "the certificate is of another CA, has expired, or is for another name; the clock here "
                   "says %1")
            .arg(QDateTime::currentDateTimeUtc().toString(Qt::ISODate));
    return Text::tr("is it HTTPS with TLS 1.2 or newer at this port?");
}

} // namespace

std::optional<ServerAddress> ServerAddress::parse(const QString &text)
{
    static const QRegularExpression form(QStringLiteral("^(\\[[^\\[\\]]+\\]|[^:\\[\\]]+):([0-9]{1,5})$"));
    const QRegularExpressionMatch match = form.match(text);
    const int port = match.captured(2).toInt();
    QUrl url;
    url.setHost(match.captured(1), QUrl::DecodedMode);
    if (port < 1 || port > kMaxPort || !url.isValid() || url.host().isEmpty())
        return std::nullopt;
    return ServerAddress{match.captured(1), port};
}

struct ServerCheck::Call
{
    Credentials credentials;
    ExchangeOutcome outcome;
    ExchangeTrace trace;
};

ServerCheck::Call ServerCheck::get(Call call, const QString &path, const QString &query) const
{
    QUrl url;
    url.setScheme(QStringLiteral("https"));
    url.setHost(m_address.host, QUrl::DecodedMode);
    url.setPort(m_address.port);
    url.setPath(path, QUrl::DecodedMode);
    if (!query.isEmpty())
        url.setQuery(query);
    traceExchange({"GET", url.toEncoded(), {}, kLimitMs, call.credentials}, call.outcome, call.trace);
    return call;
}

int ServerCheck::run()
{
    Call first;
    m_findings += transportFinding(false, first.credentials);
    if (!setUpCurl())
        m_findings += Finding::fault(key("name"), false, Text::tr("libcurl cannot be set up"), {});
    if (m_findings.constLast().state == State::Fault)
        return exitcode::kNotReached;
    first = get(first, QStringLiteral("/apiauth/v1/client/ca_cert"), {});
    if (!reach(first))
        return exitcode::kNotReached;
    compareClocks(first);
    if (const std::optional<QByteArray> ca = readCa(first))
        return askStatus(*ca);
    return first.outcome.failure.isEmpty() ? exitcode::kWouldBeRefused : exitcode::kNotReached;
}

// Name, TCP and TLS, up to the one at which it went wrong.
bool ServerCheck::reach(const Call &call)
{
    const ExchangeOutcome &outcome = call.outcome;
    const struct
    {
        const char *name;
        Reached reached;
        QString text;
        QString advice;
    } stages[] = {
        {"name", Reached::Name, m_address.host, Text::tr("check the name and the resolver of this terminal")},
        {"tcp", Reached::Tcp, Text::tr("%1 answers").arg(call.trace.address),
         Text::tr("check port, route, firewall and proxy; is the server running?")},
        {"tls", Reached::Tls,
         call.credentials.verifyPeer
             ? Text::tr("the server's certificate passes under %1").arg(describe(call.credentials.ca))
             : Text::tr("not verified, SHA-256 of the server's certificate %1").arg(outcome.peerFingerprint),
         adviceOnTls(outcome)},
    };
    for (const auto &stage : stages) {
        const bool isReached = call.trace.reached >= stage.reached;
        m_findings += isReached ? Finding::ok(key(stage.name), true, stage.text)
                                : Finding::fault(key(stage.name), false, outcome.failure, stage.advice);
        if (!isReached)
            return false;
    }
    return true;
}

void ServerCheck::compareClocks(const Call &call)
{
    const time_t told = curl_getdate(call.trace.date.constData(), nullptr);
    const qint64 difference = QDateTime::currentSecsSinceEpoch() - told;
    const QString text = Text::tr("the clock here is %1 seconds ahead of the server's").arg(difference);
    if (told < 0)
        m_findings +=
            Finding::none(key("clock"), QJsonValue::Null, Text::tr("the server does not tell its time"));
    else if (qAbs(difference) <= kMaxClockDifference)
        m_findings += Finding::ok(key("clock"), difference, text);
    else
        m_findings += Finding::fault(key("clock"), difference, text,
                                     Text::tr("set the clock: certificates fail where it is wrong"));
}

// As the first page reads the reply.
std::optional<QByteArray> ServerCheck::readCa(const Call &call)
{
    const ExchangeOutcome &outcome = call.outcome;
    const ServerReply reply(outcome.body);
    const QByteArray ca =
        QByteArray::fromBase64(reply.data().value(QStringLiteral("ca_cert")).toString().toLocal8Bit());
    Finding finding = Finding::fault(key("ca_cert"), outcome.status, outcome.failure,
                                     Text::tr("is it a management server, and nothing in between?"));
    const std::optional<QString> refusal = reply.failure(outcome.status, "");
    if (outcome.failure.isEmpty() && !reply.isJson())
        finding.text = Text::tr("status %1, and the reply is not JSON").arg(outcome.status);
    else if (outcome.failure.isEmpty() && refusal)
        finding.text = Text::tr("status %1, the server says: %2").arg(outcome.status).arg(*refusal);
    else if (outcome.failure.isEmpty() && ca.size() > PemFile::kMaxSize)
        finding.text = Text::tr("the CA is longer than %1 bytes").arg(PemFile::kMaxSize);
    else if (outcome.failure.isEmpty() && !holdsCertificates(ca))
        finding.text = Text::tr("the reply holds no CA certificate");
    else if (outcome.failure.isEmpty())
        finding = Finding::ok(key("ca_cert"), outcome.status, describe(ca));
    m_findings += finding;
    return finding.state == State::Ok ? std::optional(ca) : std::nullopt;
}

// As the first page asks, and reads the reply.
int ServerCheck::askStatus(const QByteArray &ca)
{
    QUrlQuery query;
    query.addQueryItem(QStringLiteral("machine_id"),
                       vesk::base::FileContent::instace()->getMachineID(nullptr, true));
    query.addQueryItem(QStringLiteral("keyword"), QStringLiteral("join"));
    Call second;
    second.credentials = {true, ca, {}, {}};
    second = get(second, QStringLiteral("/uim/v3/client/status"), query.query());
    const ExchangeOutcome &outcome = second.outcome;
    const ServerReply reply(outcome.body);

    const auto end = [&](int exitCode, const QString &text, const QString &advice) {
        m_findings += exitCode == exitcode::kWouldJoin
                          ? Finding::ok(key("status"), outcome.status, text)
                          : Finding::fault(key("status"), outcome.status, text, advice);
        return exitCode;
    };
    if (second.trace.reached < Reached::Tls)
        return end(exitcode::kNotReached,
                   Text::tr("not under the CA that the server hands out: %1").arg(outcome.failure),
                   adviceOnTls(outcome));
    const QString seeServer = Text::tr("look at the server's own log");
    if (!outcome.failure.isEmpty())
        return end(exitcode::kNotReached, outcome.failure, seeServer);
    if (!reply.isJson())
        return end(exitcode::kWouldBeRefused,
                   Text::tr("status %1, and the reply is not JSON").arg(outcome.status), seeServer);
    if (outcome.status != kStatusOk)
        return end(exitcode::kWouldBeRefused,
                   Text::tr("status %1, the server says: %2").arg(outcome.status).arg(reply.message()),
                   seeServer);
    if (reply.isGranted())
        return end(exitcode::kWouldJoin, Text::tr("this terminal may join"), {});
    if (reply.rawCode() == QJsonValue(kTerminalLimitCode))
        return end(exitcode::kWouldBeRefused, Text::tr("the server has no place for another terminal"),
                   Text::tr("remove terminals on the server, or extend the licence"));
    return end(exitcode::kWouldBeRefused,
               Text::tr("the server has this machine already: %1").arg(reply.message()),
               Text::tr("remove it there; or do two machines have the same identity?"));
}
