// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/hold.h"
#include "scenario/scenario.h"
#include "server/endpoints.h"

#include <QMap>

namespace sandbox {

// Stands between the connections and the endpoints: checks certificate, path and method of a request, lets
// the scenario have its say, and keeps the journal. Called by the connections, from the server's thread only;
// knows nothing of sockets.
class Dispatcher
{
public:
    Dispatcher(Domain &domain, Endpoints &endpoints, const Scenario &scenario, Journal journal);

    // Journals a request that has been read whole and decides its answer.
    Answer receive(const Request &request);
    // Journals a request that could not be read whole; its body is empty.
    Answer refuse(const Request &request, const Refusal &reason);
    // For an answer that is held: what Hold::open() gives.
    int openHold() const { return Hold(m_journal).open(); }
    // Journals an answer; called right before its first byte goes out, or its fault happens.
    void sending(const Request &request, const Answer &answer) const { note(journalText(request, answer)); }
    // Journals what happened to a connection beside requests: refused handshakes, replies that were not
    // received.
    void note(const QString &text) const { m_journal.write(QStringLiteral("server"), text); }
    // The scenario is ignored from now on.
    void repair() { m_scenario = Scenario(); }

private:
    Reply ownReply(const Request &request);
    void refuseCertificate(const Request &request) const;
    QString rightPassword(const Request &request) const;
    QJsonObject nextScript(const QString &endpoint);

    Domain &m_domain;
    Endpoints &m_endpoints;
    Scenario m_scenario;
    Journal m_journal;
    QMap<QString, int> m_scripted; // how often the script of an endpoint was used
};

} // namespace sandbox
