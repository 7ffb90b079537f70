// SPDX-License-Identifier: Apache-2.0
#include "httpclientapi.h"

#include "callreport.h"
#include "exchangemodule.h"
#include "exchangewait.h"
#include "requestaddress.h"
#include "sslconfiguration.h"

#include <QDebug>

#include <atomic>

#include <string.h>

namespace {

constexpr int kDefaultMinutes = 2;
constexpr int kMaxMinutes = 60;
constexpr int kMinuteMs = 60 * 1000;

QString reasonToRefuse(const ExchangeRequest &request, const SslConfiguration::Resolved &resolved)
{
    if (resolved.trust == SslConfiguration::Trust::FirstContact &&
        (request.method != "GET" || !request.body.isEmpty()))
        return QStringLiteral("only a GET without body goes to a server that is not verified");
    return resolved.reason;
}

} // namespace

struct HttpClientApi::Private
{
    std::atomic<bool> inProgress = false;
    int minutes = kDefaultMinutes;
    SslConfiguration configuration;

    int call(const ExchangeRequest &target, const CallReport &report, QString &reply, bool keepWindowAlive);
};

// Uses no member after the wait but through a copy: another configuration may be set meanwhile.
int HttpClientApi::Private::call(const ExchangeRequest &target, const CallReport &report, QString &reply,
                                 bool keepWindowAlive)
{
    const SslConfiguration::Resolved &resolved = configuration.resolved();
    QString reason = reasonToRefuse(target, resolved);
    ExchangeFunction exchange = reason.isEmpty() ? exchangeFunction(&reason) : nullptr;
    if (exchange == nullptr) {
        report.refused(reason);
        return 0;
    }

    ExchangeRequest request = target;
    request.credentials = resolved.credentials;
    const QString advice = configuration.takeAdvice();
    if (!advice.isEmpty())
        report.warn(advice);
    const SslConfiguration used = configuration;
    const ExchangeOutcome outcome = waitForExchange(exchange, request, keepWindowAlive);
    report.ended(outcome, used);
    if (!outcome.failure.isEmpty())
        return 0;
    // With the size, without which Qt decodes no more than stands before the first NUL.
    reply = QString::fromUtf8(outcome.body.constData(), outcome.body.size());
    return outcome.status;
}

HttpClientApi::HttpClientApi(QObject *parent, bool shareConnection)
    : QObject(parent)
    , m_private(std::make_shared<Private>())
{
    if (shareConnection)
        qWarning() << "HttpClientApi: requests never share a connection";
}

HttpClientApi::~HttpClientApi() = default;

void HttpClientApi::setReplyTimer(const int &minutes)
{
    if (minutes >= 1 && minutes <= kMaxMinutes)
        m_private->minutes = minutes;
    else
        qWarning() << "HttpClientApi: reply timer of" << minutes << "minutes refused, it stays"
                   << m_private->minutes;
}

void HttpClientApi::setSSLConfig(const QString &caFile, const QString &certificateFile,
                                 const QString &keyFile)
{
    m_private->configuration = SslConfiguration(caFile, certificateFile, keyFile);
}

int HttpClientApi::getRequest(QString &reply, const QString &url, const QString &body, bool keepWindowAlive)
{
    return request("GET", reply, url, body, keepWindowAlive);
}

int HttpClientApi::postRequest(QString &reply, const QString &url, const QString &body, bool keepWindowAlive)
{
    return request("POST", reply, url, body, keepWindowAlive);
}

int HttpClientApi::request(const char *method, QString &reply, const QString &url, const QString &body,
                           bool keepWindowAlive)
{
    reply.clear();
    const RequestAddress address(url);
    const CallReport report(method, address.display());
    if (!address.isValid()) {
        report.refused(QStringLiteral("the address is not an https address with a host"));
        return 0;
    }
    // Held here as well: the object may be deleted by an event that is processed during the wait.
    const std::shared_ptr<Private> held = m_private;
    if (held->inProgress.exchange(true)) {
        report.refused(QStringLiteral("another call is in progress"));
        return 0;
    }
    const ExchangeRequest request{method, address.encoded(), body.toUtf8(), held->minutes * kMinuteMs, {}};
    const int status = held->call(request, report, reply, keepWindowAlive);
    // Not through data(), which would overwrite a copy of what the copies of the request share.
    ::explicit_bzero(const_cast<char *>(request.body.constData()), static_cast<size_t>(request.body.size()));
    held->inProgress = false;
    return status;
}
