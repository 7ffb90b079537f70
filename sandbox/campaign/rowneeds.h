// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/row.h"

namespace sandbox {

// Rows that cannot run everywhere say so under "needs":
//     root      some other user's files, which only root can make
//     isolation a tool that can show a file system read-only
//     mounts    a mount namespace of its own
//     strace    that tool
namespace rowneeds {

// Exit code of a row that was left out.
constexpr int kLeftOut = 77;

QStringList names();

// Why this row cannot run here; empty when it can. Tries things out, and leaves no trace of that.
QString lacking(const Row &row);

// Moves this process into a mount namespace of its own, in which the world's /tmp is a file system of that
// many kilobytes. To be called before the process does anything else. False with one line in `error`.
bool enterSmallTmp(const QString &tmp, int kilobytes, QString *error);

} // namespace rowneeds

} // namespace sandbox
