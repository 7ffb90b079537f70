// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QStringList>

namespace sandbox {

// How a scenario has its program started.
struct ProgramStart
{
    QStringList isolation; // further options of vesk-isolate
    QStringList command;
};

// What a scenario says under "start":
//     umask        octal digits
//     read_only    paths that the program finds on a read-only file system
//     traced       true: the arguments of every process that it starts, and so on, go to the file `starts`
// "small_tmp" comes before it; see needs.h.
ProgramStart programStart(const QJsonObject &start, const QString &program, const QString &starts);

} // namespace sandbox
