// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "service.h"

namespace sandbox {

// The login manager: a reboot ends the run of the world, which its launcher learns through the signal.
class LoginService : public Service
{
    Q_OBJECT

public:
    LoginService(const StateFolder &state, const ServiceScript &script);
    bool publish(QDBusConnection bus) override;

public Q_SLOTS:
    void Reboot(bool interactive);

Q_SIGNALS:
    void rebootAsked();
};

} // namespace sandbox
