// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statefolder.h"

#include <QJsonValue>
#include <QStringList>

namespace sandbox {

// Makes one of the things that obstacles.h lists. path: where it is to stand, absolute, with nothing there
// now. original: where the file lies that stood there before; empty: none did. False with one line in
// `error`.
bool makeObstacle(const StateFolder &state, const QString &path, const QString &original,
                  const QJsonValue &kind, QString *error);

// Where the links among them lead to, as the program sees it.
QStringList obstacleTargets();

} // namespace sandbox
