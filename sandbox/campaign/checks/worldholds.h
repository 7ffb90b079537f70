// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statefolder.h"

#include <QJsonObject>

namespace sandbox {

// Compares what a world holds beside the terminal's files with what a row says under "world":
//     known      the server counts the terminal among its own
//     identity   the identity service lets domain accounts log in
//     services   the user's services are to be started
// each true or false; what is not said is not looked at. One line for each difference.
QStringList worldHolds(const StateFolder &state, const QJsonObject &expected);

} // namespace sandbox
