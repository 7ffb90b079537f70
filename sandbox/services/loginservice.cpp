// SPDX-License-Identifier: Apache-2.0
#include "loginservice.h"

#include "loginadaptor.h"

namespace sandbox {

LoginService::LoginService(const StateFolder &state, const ServiceScript &script)
    : Service(state, script, QStringLiteral("org.freedesktop.login1"))
{
    new LoginAdaptor(this);
}

bool LoginService::publish(QDBusConnection bus)
{
    return bus.registerObject(QStringLiteral("/org/freedesktop/login1"), this);
}

void LoginService::Reboot(bool interactive)
{
    const QString call =
        QStringLiteral("Reboot(%1)").arg(interactive ? QStringLiteral("true") : QStringLiteral("false"));
    if (!begin(QStringLiteral("Reboot"), call))
        return;
    note(call);
    leave(QStringLiteral("Reboot"), QVariant());
    Q_EMIT rebootAsked();
}

} // namespace sandbox
