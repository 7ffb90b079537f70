// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

// Scenarios that cannot run everywhere say so under "needs":
//     root      some other user's files, which only root can make
//     isolation a tool that can show a file system read-only
//     mounts    a mount namespace of its own
//     strace    that tool
namespace sandbox::needs {

// Why a scenario with these needs cannot run here; empty when it can. Tries things out, and leaves no trace
// of that.
QString lacking(const QStringList &needs);

// Starts this program with other arguments in a mount namespace in which the world's /tmp is a file system of
// that many kilobytes. Returns its exit code.
int runInSmallTmp(const QString &tmp, int kilobytes, const QStringList &arguments);

} // namespace sandbox::needs
