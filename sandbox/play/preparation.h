// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statefolder.h"

#include <QJsonObject>

namespace sandbox {

// Does to the files of a world what a scenario says under "prepare", after the world has started and before
// the program does:
//     record      keys laid over the terminal's record
//     resolver    "silent": the program's name server, asked for names that are in no table, never answers
//     places      see obstacles.h
// False with one line in `error`.
bool prepareFiles(const StateFolder &state, const QJsonObject &prepare, QString *error);

// Before the world starts: writes a scenario to `file`, with its placeholders filled in, and lays what it
// says of the server's configuration over that of a world that has one already. False with one line in
// `error`.
bool writeScenario(const StateFolder &state, const QJsonObject &scenario, const QString &file,
                   QString *error);

} // namespace sandbox
