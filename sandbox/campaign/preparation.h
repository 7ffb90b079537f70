// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "world/statefolder.h"

#include <QJsonObject>

namespace sandbox {

// Does to the files of a world what a row says under "prepare", after the world has started and before the
// program does:
//     record      keys laid over the terminal's record
//     resolver    "silent": the program's name server, asked for names that are in no table, never answers
//     places      see obstacles.h
// False with one line in `error`.
bool prepareFiles(const StateFolder &state, const QJsonObject &prepare, QString *error);

} // namespace sandbox
