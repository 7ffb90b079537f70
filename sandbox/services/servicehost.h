// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "service.h"

#include <array>
#include <memory>

namespace sandbox {

// One service of a world as a process of its own: puts the service on its bus, says so to the launcher and
// serves until the process is ended. Runs in `vesk-sandbox service NAME`.
namespace servicehost {

struct Entry
{
    QString name; // as scenarios have it
    QString busName;
    QString interface;  // that its contract is named after
    bool isOnSystemBus; // else on the session bus
    std::unique_ptr<Service> (*make)(const StateDirectory &, const QJsonObject &script, const Entry &);
};

const std::array<Entry, 4> &all();

// The lines for the launcher on standard output.
constexpr char kReady[] = "ready";
constexpr char kReboot[] = "reboot";
void tellLauncher(const char *line);

// Needs a QCoreApplication. Returns the exit code; a failed start leaves one line on standard error.
int run(const QString &name, const QString &statePath);

} // namespace servicehost

} // namespace sandbox
