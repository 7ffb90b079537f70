// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "service.h"

namespace sandbox {

// The network daemon: reports the connections that stand in the state folder, as they stand there. A new
// world has two, of which the second is the primary one.
class NetworkService : public Service
{
    Q_OBJECT

public:
    NetworkService(const StateFolder &state, const QJsonObject &script);

public Q_SLOTS:
    QString GetActiveConnectionInfo();
};

} // namespace sandbox
