// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/journal.h"
#include "scenario/scenario.h"

#include <QString>

#include <memory>

namespace sandbox {

// The management server of a world: HTTPS on the loopback addresses of this machine, at an enrolment address
// open to everyone and a managed one that asks for a terminal's certificate. Used by the launcher and,
// in their own process, by tests. All it keeps is in its state directory, so a new server goes on where the
// one before it left off:
//     config.json                        accounts, limit, rule, terminals, ports; see Domain
//     ca.crt, ca.key, enrolment.*, managed.*, issued/<machine identity>.crt
// It serves on threads of its own and needs no event loop. Two servers must not share a directory.
class ManagementServer
{
public:
    // Accepts connections from now on. `stateDirectory` is made when it is missing (mode 0700); a new one
    // takes its configuration from the scenario. A port other than 0 is kept as that of the enrolment
    // address. Throws an Error; a damaged configuration or certificate file is named and left as it is.
    ManagementServer(const QString &stateDirectory, const Scenario &scenario, const Journal &journal,
                     quint16 enrolmentPort = 0);
    ~ManagementServer(); // stops

    // From now on the scenario is ignored and everything works.
    void repair();
    // Ends every connection at once; the server runs on.
    void dropConnections();

    // A scenario in which nothing listens has its port all the same.
    quint16 enrolmentPort() const { return m_enrolmentPort; }
    quint16 managedPort() const { return m_managedPort; }

private:
    class Parts;

    std::unique_ptr<Parts> m_parts;
    quint16 m_enrolmentPort = 0;
    quint16 m_managedPort = 0;
};

} // namespace sandbox
