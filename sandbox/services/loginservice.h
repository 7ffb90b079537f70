// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "service.h"

namespace sandbox {

// The login manager: a reboot ends the run of the world, which its launcher learns through standard output.
class LoginService : public Service
{
    Q_OBJECT

public:
    LoginService(const StateFolder &state, const QJsonObject &script);

public Q_SLOTS:
    void Reboot(bool interactive);
};

} // namespace sandbox
