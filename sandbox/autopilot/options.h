// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "pages.h"

namespace sandbox {

/// What the command line of vesk-autopilot asks for.
struct Options
{
    Journey journey = Journey::Join;
    QString scenario = QStringLiteral("join-ok");   ///< a name or a file
    QString program = QStringLiteral("维斯克平台"); ///< as the program presents itself
    QString port;      ///< typed where the scenario names none; empty: none known
    QString journal;   ///< a file; empty: no journal
    QString pictures;  ///< a folder; empty: no pictures
    QString stayAfter; ///< part of a line of the journal; empty: none
    int timeout = 120; ///< seconds for the whole walk, 1 to 3600
};

/// Reads the command line; prints help and version itself and ends the process then. Throws a Trouble that
/// names what is wrong. `--state DIR` stands for the journal of a world and the port of its server.
Options readOptions(const QStringList &arguments);

} // namespace sandbox
