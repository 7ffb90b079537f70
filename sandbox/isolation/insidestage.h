// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

#include <optional>

namespace sandbox {

// The first process inside the isolation: vesk-isolate once more, called by the isolation tool. It takes away
// files that are to be absent and becomes the command, with the signals' usual meaning restored. Where the
// tool leaves children that outlive the command, this process stays and ends them.

// The command line for it. reap: the tool leaves children.
QStringList insideStage(bool reap, const QStringList &absent, const QStringList &command);

// arguments: of this process. Nothing when insideStage() has not made them; else the exit code for the
// process: the command's, 128 + signal, 126 or 127.
std::optional<int> runInsideStage(const QStringList &arguments);

} // namespace sandbox
