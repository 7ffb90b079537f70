// SPDX-License-Identifier: Apache-2.0
#include "methodservices.h"

#include "loginadaptor.h"
#include "servicehost.h"

namespace sandbox {

LoginService::LoginService(const StateDirectory &state, const QJsonObject &script)
    : Service(state, script, QStringLiteral("org.freedesktop.login1"))
{
    new LoginAdaptor(this);
}

void LoginService::Reboot(bool interactive)
{
    const QString call =
        QStringLiteral("Reboot(%1)").arg(interactive ? QStringLiteral("true") : QStringLiteral("false"));
    if (!begin(QStringLiteral("Reboot"), call))
        return;
    note(call);
    leave(QStringLiteral("Reboot"), QVariant());
    ServiceHost::tellLauncher(ServiceHost::kReboot);
}

} // namespace sandbox
