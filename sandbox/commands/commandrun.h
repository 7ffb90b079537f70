// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

namespace sandbox {

// The result of a stand-in command.
struct Outcome
{
    int exitCode = 0;
    QByteArray output; // for standard output
    QByteArray errors; // for standard error
};

// One call of a command that the program makes on a terminal: gsettings, systemctl, killall or id. Inside a
// world the calls reach these stand-ins, which touch the world's own state and nothing else. Does what the
// scenario wants of the command, or else what the command does, and journals the call.
Outcome runCommand(const QString &name, const QStringList &arguments, const StateDirectory &state,
                   const QJsonObject &script);

} // namespace sandbox
