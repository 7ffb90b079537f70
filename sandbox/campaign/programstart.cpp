// SPDX-License-Identifier: Apache-2.0
#include "campaign/programstart.h"

#include "scenario/strictobject.h"

#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kMostTmpKb = 1024;
constexpr int kMostJoins = 1000;

} // namespace

ProgramStart programStart(const QJsonObject &start, const QString &program, const QString &starts)
{
    StrictObject strict(start, QStringLiteral("start"));
    ProgramStart result;
    result.command = QStringList{program};
    // Nothing is abbreviated: what is looked for may stand at the end of a long argument.
    if (strict.flag("traced").value_or(false))
        result.command = QStringList{QStringLiteral("strace"),
                                     QStringLiteral("-f"),
                                     QStringLiteral("-qq"),
                                     QStringLiteral("-s"),
                                     QStringLiteral("1000000"),
                                     QStringLiteral("-e"),
                                     QStringLiteral("trace=execve,execveat"),
                                     QStringLiteral("-e"),
                                     QStringLiteral("signal=none"),
                                     QStringLiteral("-o"),
                                     starts} +
                         result.command;
    if (strict.flag("ordinary").value_or(false) && ::getuid() == 0)
        result.command = QStringList{QStringLiteral("setpriv"), QStringLiteral("--bounding-set=-all"),
                                     QStringLiteral("--inh-caps=-all")} +
                         result.command;
    if (const auto umask = strict.text("umask"))
        result.command =
            QStringList{QStringLiteral("sh"), QStringLiteral("-c"),
                        QStringLiteral("umask %1 && exec \"$@\"").arg(*umask), QStringLiteral("sh")} +
            result.command;
    for (const QString &path : strict.texts("read_only").value_or(QStringList()))
        result.isolation << QStringLiteral("--read-only") << path;
    strict.number("small_tmp", 1, kMostTmpKb);
    strict.number("joins", 1, kMostJoins);
    strict.refuseOthers();
    return result;
}

} // namespace sandbox
