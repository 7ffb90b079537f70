// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "server/serverconfig.h"

#include <QDateTime>
#include <QHash>

namespace sandbox {

// The domain that the server manages: who may log in, which terminals belong to it, which certificates count.
// Each change is in the configuration file before the function returns. Used by the endpoints, from the
// server's thread only.
class Domain
{
public:
    Domain(ServerConfig config, QString configPath);

    const ServerConfig &config() const { return m_config; }

    // Null when there is none of that name (names are compared exactly).
    const Account *account(const QString &name) const;
    const Account *administrator(const QString &name) const;
    const Department *department(const QString &id) const;
    const Terminal *terminal(const QString &machineId) const;

    bool isFull() const;
    bool isNameTaken(const QString &terminalName) const;
    bool isRevoked(const QString &certificateSerial) const;

    // All three change nothing when the file cannot be written, and then return false with `error` set.
    bool keepPorts(int enrolmentPort, int managedPort, QString *error);
    bool add(const Terminal &terminal, QString *error);
    // Takes the terminal out and revokes its certificate.
    bool remove(const QString &machineId, QString *error);

    // An administrator allows one removal of one terminal, for ten minutes or until the server ends.
    void allowRemoval(const QString &machineId, const QString &administrator);
    bool mayRemove(const QString &machineId, const QString &administrator) const;

private:
    struct Permit
    {
        QString administrator;
        QDateTime until;
    };

    bool replace(const ServerConfig &config, QString *error);

    ServerConfig m_config;
    QString m_configPath;
    QHash<QString, Permit> m_permits; // by machine identity
};

// Now, as it stands in the configuration: ISO 8601, UTC.
QString timeStamp();

} // namespace sandbox
