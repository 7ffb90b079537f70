// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "service.h"

// The services that are called by methods; adaptors made from their contracts stand before them.
namespace sandbox {

// The network daemon: reports the connections that stand in the state directory, as they stand there. A new
// world has two, of which the second is the primary one.
class NetworkService : public Service
{
    Q_OBJECT

public:
    NetworkService(const StateDirectory &state, const QJsonObject &script);

public Q_SLOTS:
    QString GetActiveConnectionInfo();
};

// The system service that keeps the terminal's record and keys. "join" makes their directory ready,
// "copyConfig" installs what the client has staged, "remove" brings the record in line with the staged one
// and takes the keys away. Returns 0, or -1 when the operation is unknown or could not be carried out.
class VeskgService : public Service
{
    Q_OBJECT

public:
    VeskgService(const StateDirectory &state, const QJsonObject &script);

public Q_SLOTS:
    int onDomainConfig(const QString &operation);

private:
    bool carryOut(const QString &operation) const;
    void awaitEndOfUserServices() const;
};

// The login manager: a reboot ends the run of the world, which its launcher learns through standard output.
class LoginService : public Service
{
    Q_OBJECT

public:
    LoginService(const StateDirectory &state, const QJsonObject &script);

public Q_SLOTS:
    void Reboot(bool interactive);
};

} // namespace sandbox
