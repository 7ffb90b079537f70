// SPDX-License-Identifier: Apache-2.0
#include "server/frontdesk.h"

#include "journal/hold.h"

#include <algorithm>
#include <array>

namespace sandbox {

namespace {

enum class Reach { Enrolment, Managed, Both };

struct Route
{
    const char *endpoint; // as scenarios name it
    const char *method;
    const char *path;
    Reach reach;
    Reply (Endpoints::*answer)(const Request &);
};

constexpr std::array<Route, 10> kRoutes = {{
    {"ca_cert", "GET", "/apiauth/v1/client/ca_cert", Reach::Enrolment, &Endpoints::caCertificate},
    {"status", "GET", "/uim/v3/client/status", Reach::Both, &Endpoints::status},
    {"auth", "POST", "/uim/v3/client/auth", Reach::Enrolment, &Endpoints::auth},
    {"join", "POST", "/uim/v3/client/join", Reach::Enrolment, &Endpoints::join},
    {"rule", "GET", "/uim/v3/client/config", Reach::Enrolment, &Endpoints::rule},
    {"verify_name", "GET", "/uim/v3/client/pc/verify/name", Reach::Enrolment, &Endpoints::verifyName},
    {"remove_status", "POST", "/uim/v3/client/remove_status", Reach::Managed, &Endpoints::removeStatus},
    {"remove", "POST", "/uim/v3/client/remove", Reach::Managed, &Endpoints::remove},
    {"department", "GET", "/uim/v3/client/uim_department/id", Reach::Managed, &Endpoints::department},
    {"account", "GET", "/uim/v3/client/account", Reach::Managed, &Endpoints::account},
}};

const Route *routeOf(const Request &request)
{
    const QString path = request.target.path();
    const auto *route = std::find_if(kRoutes.begin(), kRoutes.end(), [&](const Route &candidate) {
        return path == QLatin1String(candidate.path);
    });
    return route == kRoutes.end() ? nullptr : route;
}

Reply scripted(const EndpointScript &script)
{
    return {script.status.value_or(200),
            script.body.value_or(QByteArray()),
            script.bodyIsJson,
            {},
            script.location};
}

} // namespace

FrontDesk::FrontDesk(Domain &domain, Endpoints &endpoints, const Scenario &scenario, Journal journal)
    : m_domain(domain)
    , m_endpoints(endpoints)
    , m_scenario(scenario)
    , m_journal(std::move(journal))
{
}

Answer FrontDesk::receive(const Request &request)
{
    m_journal.write(QStringLiteral("server"), journalText(request));
    const Route *route = routeOf(request);
    const EndpointScript script =
        route == nullptr ? EndpointScript() : nextScript(QLatin1String(route->endpoint));
    const bool replaced = script.status || script.body;
    Answer answer{replaced ? scripted(script) : ownReply(request), script.delayMs, script.fault,
                  script.isHeld};
    if (answer.isHeld)
        note(QStringLiteral("reply to %1 %2 is held for now").arg(request.method, request.target.path()));
    return answer;
}

Answer FrontDesk::refuse(const Request &request, const Refusal &reason)
{
    m_journal.write(QStringLiteral("server"), journalText(request));
    return {refusal({reason})};
}

int FrontDesk::openHold() const
{
    return Hold(m_journal).open();
}

void FrontDesk::sending(const Request &request, const Answer &answer) const
{
    m_journal.write(QStringLiteral("server"), journalText(request, answer));
}

void FrontDesk::note(const QString &text) const
{
    m_journal.write(QStringLiteral("server"), text);
}

void FrontDesk::mend()
{
    m_scenario = Scenario();
}

Reply FrontDesk::ownReply(const Request &request)
{
    try {
        if (request.door == Door::Managed)
            refuseCertificate(request);
        const Route *route = routeOf(request);
        const Reach elsewhere = request.door == Door::Managed ? Reach::Enrolment : Reach::Managed;
        if (route == nullptr || (route->reach == elsewhere && request.door == Door::Managed))
            throw Refused{refusals::kPathUnknown};
        if (route->reach == elsewhere)
            throw Refused{refusals::kOnlyManaged};
        if (request.method != QLatin1String(route->method)) {
            Reply reply = refusal({refusals::kMethodWrong});
            reply.allow = QLatin1String(route->method);
            return reply;
        }
        return (m_endpoints.*route->answer)(request);
    } catch (const Refused &refused) {
        if (!refused.cause.isEmpty())
            note(QStringLiteral("trouble ") + refused.cause);
        return refusal(refused);
    }
}

// The handshake has shown that our CA issued it; here it must be the one that its terminal holds today.
void FrontDesk::refuseCertificate(const Request &request) const
{
    if (m_domain.isRevoked(request.certificateSerial))
        throw Refused{refusals::kCertificateRevoked};
    const QJsonObject terminal = m_domain.terminal(request.certificateName);
    if (terminal.value(QLatin1String("certificate_serial")).toString() != request.certificateSerial)
        throw Refused{refusals::kCertificateUnknown};
}

EndpointScript FrontDesk::nextScript(const QString &endpoint)
{
    EndpointScript script = m_scenario.endpoint(endpoint);
    if (script.times >= 0 && m_scripted[endpoint] >= script.times)
        return {};
    ++m_scripted[endpoint];
    return script;
}

} // namespace sandbox
