// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// One service of a world as a process of its own: puts the service on its bus, says so to the launcher and
// serves until the process is ended. Runs in `vesk-sandbox service NAME`.
class ServiceHost
{
public:
    // The lines for the launcher on standard output.
    static constexpr const char *kReady = "ready";
    static constexpr const char *kReboot = "reboot";
    static void tellLauncher(const char *line);

    static QStringList names();                     // network, veskg, iam, login
    static bool isOnSystemBus(const QString &name); // else on the session bus
    static QString busName(const QString &name);

    // Needs a QCoreApplication. Returns the exit code; a failed start leaves one line on standard error.
    static int run(const QString &name, const QString &statePath);
};

} // namespace sandbox
