// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/journal.h"
#include "scenario/scenario.h"

#include <QString>

#include <memory>

namespace sandbox {

// The management server of a world: HTTPS on the loopback addresses of this machine, at an enrolment address
// open to everyone and a managed one that asks for a terminal's certificate. Used by the launcher and,
// in their own process, by tests. All it keeps is in its state directory, so a stopped server goes on where
// it left off:
//     config.json                        accounts, limit, rule, terminals, ports; see Domain
//     ca.crt, ca.key, enrolment.*, managed.*, issued/<machine identity>.crt
// It serves on one thread of its own and needs no event loop. Two servers must not share a directory.
class ManagementServer
{
public:
    // `stateDirectory` is made when it is missing (mode 0700); a new one takes its configuration from the
    // scenario.
    ManagementServer(QString stateDirectory, const Scenario &scenario, const Journal &journal);
    ~ManagementServer(); // stops

    // Chooses this port for the enrolment address, and keeps it in the configuration; before start() only.
    void useEnrolmentPort(quint16 port) { m_wantedPort = port; }

    // Returns true once connections are accepted. Else sets `error` to one line; a damaged configuration or
    // certificate file is named and left as it is.
    bool start(QString *error);

    // From now on the scenario is ignored and everything works. Needs a running server.
    void repair();
    // Ends every connection at once; the server runs on.
    void dropConnections();

    // 0 before the first start. A scenario in which nothing listens has its port all the same.
    quint16 enrolmentPort() const { return m_enrolmentPort; }
    quint16 managedPort() const { return m_managedPort; }

private:
    class Running;

    std::unique_ptr<Running> prepared(QString *error) const;
    bool openListeners(Running &running, QString *error);

    QString m_state;
    Scenario m_scenario;
    Journal m_journal;
    quint16 m_wantedPort = 0;
    quint16 m_enrolmentPort = 0;
    quint16 m_managedPort = 0;
    std::unique_ptr<Running> m_running;
};

} // namespace sandbox
