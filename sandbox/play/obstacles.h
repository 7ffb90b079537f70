// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

#include <QJsonObject>

// Things that stand in a world where the program looks for a file or wants to write one. A scenario names
// them under "prepare"."places", by the absolute path that the program sees:
//     absent, empty, directory, dangling (a link to nothing), link-directory and link-file (to one
//     elsewhere), device (endless), fifo, huge (1 GB, sparse), garbage open-directory, sticky-directory
//     (others can write), foreign-directory and foreign-open-directory (another user's; need root)
//     unreadable, read-only, truncated, foreign (another user's; needs root), readable: what stood there, or
//     an old line, with that mode, owner or length
//     world-ca, other-ca, other-certificate, other-key: of the server, of another CA, of another terminal of
//     this one filler: a file that takes all space there is
//     {"text": ...}, {"hex": ...}: a file that holds that
// What stood at a path before is kept in the state directory, so that it can be put back.
namespace sandbox::obstacles {

// Throws an Error.
void put(const StateDirectory &state, const QJsonObject &places);

// Takes away those that still stand, and puts back what stood there before. Safe to call again.
void clear(const StateDirectory &state);

} // namespace sandbox::obstacles
