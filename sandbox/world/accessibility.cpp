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
    return {};
}

} // namespace

void GuardedChild::setupChildProcess()
{
    leaveGuardBehind();
}

bool Accessibility::start(const QProcessEnvironment &environment, QString *error)
{
    const QString program = launcher();
    if (program.isEmpty()) {
        *error = QStringLiteral("at-spi-bus-launcher is not installed");
        return false;
    }
    if (!m_launcher.startIn(environment, program, {QStringLiteral("--launch-immediately")}, error))
        return false;
    const QString session = environment.value(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"));
    try {
        // Vanished as long as the launcher does not own its name.
        waitFor(QDeadlineTimer(kStartLimitMs), QStringLiteral("%1 is not ready in time").arg(program), [&] {
            m_address = AccessibleBus(session, kStartLimitMs).switchOn();
            return !m_address.isEmpty();
        });
    } catch (const Error &failure) {
        *error = failure.text();
        return false;
    }
    return true;
}

} // namespace sandbox
