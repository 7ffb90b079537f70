// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// The first process inside the isolation: vesk-isolate once more, called by the isolation tool. It takes away
// files that are to be absent and becomes the command, with the signals' usual meaning restored. Where the
// tool leaves children that outlive the command, this process stays and ends them.
struct InsideStage
{
    bool reap = false;
    QStringList absent;
    QStringList command;

    QStringList toArguments() const;
    // arguments: what toArguments() gave, or any other command line, for which false is returned.
    static bool parse(const QStringList &arguments, InsideStage *stage);

    // Returns the exit code for the process: the command's, 128 + signal, 126 or 127.
    int run() const;
};

} // namespace sandbox
