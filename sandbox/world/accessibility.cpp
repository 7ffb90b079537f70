// SPDX-License-Identifier: Apache-2.0
#include "accessibility.h"

#include "autopilot/accessiblebus.h"
#include "autopilot/waitfor.h"
#include "isolation/guard.h"

#include <QFileInfo>

namespace sandbox {

namespace {

constexpr int kStartLimitMs = 15000;

QString launcher()
{
    for (const char *path :
         {"/usr/libexec/at-spi-bus-launcher", "/usr/lib/at-spi2-core/at-spi-bus-launcher"}) {
        if (QFileInfo(QLatin1String(path)).isExecutable())
            return QLatin1String(path);
    }
    throw Error(QStringLiteral("at-spi-bus-launcher is not installed"));
}

} // namespace

void GuardedChild::setupChildProcess()
{
    leaveGuardBehind();
}

void Accessibility::start(const QProcessEnvironment &environment)
{
    const QString program = launcher();
    m_launcher.startIn(environment, program, {QStringLiteral("--launch-immediately")});
    const QString session = environment.value(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"));
    // Vanished as long as the launcher does not own its name.
    waitFor(QDeadlineTimer(kStartLimitMs), QStringLiteral("%1 is not ready in time").arg(program), [&] {
        m_address = AccessibleBus(session, kStartLimitMs).switchOn();
        return !m_address.isEmpty();
    });
}

} // namespace sandbox
