// SPDX-License-Identifier: Apache-2.0
#include "server/dispatcher.h"

#include "journal/error.h"

#include <QJsonDocument>

#include <algorithm>
#include <array>

namespace sandbox {

namespace {

struct Route
{
    const char *endpoint; // as scenarios name it
    const char *method;
    const char *path;
    bool isEnrolment; // whether the address serves it
    bool isManaged;
    Reply (Endpoints::*answer)(const Request &);
};

constexpr std::array<Route, 8> kRoutes = {{
    {"ca_cert", "GET", "/apiauth/v1/client/ca_cert", true, false, &Endpoints::caCertificate},
    {"status", "GET", "/uim/v3/client/status", true, true, &Endpoints::status},
    {"auth", "POST", "/uim/v3/client/auth", true, false, &Endpoints::auth},
    {"join", "POST", "/uim/v3/client/join", true, false, &Endpoints::join},
    {"rule", "GET", "/uim/v3/client/config", true, false, &Endpoints::rule},
    {"verify_name", "GET", "/uim/v3/client/pc/verify/name", true, false, &Endpoints::verifyName},
    {"remove_status", "POST", "/uim/v3/client/remove_status", false, true, &Endpoints::removeStatus},
    {"remove", "POST", "/uim/v3/client/remove", false, true, &Endpoints::remove},
}};

const Route *routeOf(const Request &request)
{
    const QString path = request.target.path();
    const auto *route = std::find_if(kRoutes.begin(), kRoutes.end(), [&](const Route &candidate) {
        return path == QLatin1String(candidate.path);
    });
    return route == kRoutes.end() ? nullptr : route;
}

std::optional<QByteArray> scriptedBody(const QJsonObject &script)
{
    if (script.contains(QLatin1String("json")))
        return QJsonDocument(json::object(script, "json")).toJson(QJsonDocument::Compact);
    if (script.contains(QLatin1String("body_hex")))
        return QByteArray::fromHex(json::text(script, "body_hex").toLatin1());
    if (script.contains(QLatin1String("body")))
        return json::text(script, "body").toUtf8();
    return std::nullopt;
}

} // namespace

Dispatcher::Dispatcher(Domain &domain, Endpoints &endpoints, const Scenario &scenario, Journal journal)
    : m_domain(domain)
    , m_endpoints(endpoints)
    , m_scenario(scenario)
    , m_journal(std::move(journal))
{
}

Answer Dispatcher::receive(const Request &request)
{
    note(journalText(request, rightPassword(request)));
    const Route *route = routeOf(request);
    const QJsonObject script = route == nullptr ? QJsonObject() : nextScript(QLatin1String(route->endpoint));
    Answer answer;
    answer.fault = valueOf<Fault>(script, "fault");
    answer.isHeld = json::flag(script, "hold");
    const std::optional<QByteArray> body = scriptedBody(script);
    if (body || script.contains(QLatin1String("status")))
        answer.reply = {json::number(script, "status", 200),
                        body.value_or(""),
                        script.contains(QLatin1String("json")),
                        {},
                        json::text(script, "location")};
    else
        answer.reply = ownReply(request);
    if (answer.isHeld)
        note(QStringLiteral("reply to %1 %2 is held for now").arg(request.method, request.target.path()));
    return answer;
}

Answer Dispatcher::refuse(const Request &request, const Refusal &reason)
{
    note(journalText(request, QString()));
    return {refusal({reason})};
}

Reply Dispatcher::ownReply(const Request &request)
{
    try {
        const bool isManaged = request.listener == Listener::Managed;
        if (isManaged)
            refuseCertificate(request);
        const Route *route = routeOf(request);
        if (route == nullptr || (isManaged && !route->isManaged))
            throw Refused{refusals::kPathUnknown};
        if (!isManaged && !route->isEnrolment)
            throw Refused{refusals::kOnlyManaged};
        if (request.method != QLatin1String(route->method)) {
            Reply reply = refusal({refusals::kMethodWrong});
            reply.allow = QLatin1String(route->method);
            return reply;
        }
        return (m_endpoints.*route->answer)(request);
    } catch (const Refused &refused) {
        return refusal(refused);
    } catch (const Error &error) {
        note(QStringLiteral("internal error: ") + error.text());
        return refusal({refusals::kInternalError});
    }
}

// The handshake has shown that our CA issued it; here it must be the one that its terminal holds today.
void Dispatcher::refuseCertificate(const Request &request) const
{
    if (m_domain.isRevoked(request.certificateSerial))
        throw Refused{refusals::kCertificateRevoked};
    const QJsonObject terminal = m_domain.terminal(request.certificateName);
    if (terminal.value(QLatin1String("certificate_serial")).toString() != request.certificateSerial)
        throw Refused{refusals::kCertificateUnknown};
}

// Of whoever the body names.
QString Dispatcher::rightPassword(const Request &request) const
{
    const QString name = json::text(QJsonDocument::fromJson(request.body).object(), "username");
    const QJsonObject administrator = m_domain.administrator(name);
    return json::text(administrator.isEmpty() ? m_domain.account(name) : administrator, "password");
}

QJsonObject Dispatcher::nextScript(const QString &endpoint)
{
    QJsonObject script = m_scenario.endpoint(endpoint);
    const int times = json::number(script, "times", -1);
    if (times >= 0 && m_scripted[endpoint] >= times)
        return {};
    ++m_scripted[endpoint];
    return script;
}

} // namespace sandbox
