// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "service.h"

namespace sandbox {

// The system service that keeps the terminal's record and keys. "join" makes their folder ready, "copyConfig"
// installs what the client has staged, "remove" brings the record in line with the staged one and takes the
// keys away. Returns 0, or -1 when the operation is unknown or could not be carried out.
class VeskgService : public Service
{
    Q_OBJECT

public:
    VeskgService(const StateFolder &state, const QJsonObject &script);

public Q_SLOTS:
    int onDomainConfig(const QString &operation);

private:
    bool carryOut(const QString &operation) const;
    void awaitEndOfUserServices() const;
};

} // namespace sandbox
