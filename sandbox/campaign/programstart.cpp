// SPDX-License-Identifier: Apache-2.0
#include "campaign/programstart.h"

#include "scenario/strictobject.h"

namespace sandbox {

namespace {

constexpr int kMostTmpKb = 1024;
constexpr int kMostJoins = 1000;

// Nothing is abbreviated: what is looked for may stand at the end of a long argument. A leak sanitizer, where
// there is one, cannot do its work in a traced process.
QStringList traced(const QStringList &command, const QString &starts)
{
    const QString options = QStringLiteral("-f -qq -s 1000000 -e trace=execve,execveat -e signal=none");
    const QString sanitizer =
        QStringLiteral("ASAN_OPTIONS=%1:detect_leaks=0").arg(qEnvironmentVariable("ASAN_OPTIONS"));
    return QStringList{QStringLiteral("strace")} + options.split(QLatin1Char(' ')) +
           QStringList{QStringLiteral("-E"), sanitizer, QStringLiteral("-o"), starts} + command;
}

} // namespace

ProgramStart programStart(const QJsonObject &start, const QString &program, const QString &starts)
{
    StrictObject strict(start, QStringLiteral("start"));
    ProgramStart result;
    result.command = QStringList{program};
    if (strict.flag("traced").value_or(false))
        result.command = traced(result.command, starts);
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
