// SPDX-License-Identifier: Apache-2.0
#include "play/programstart.h"

#include "scenario/json.h"

namespace sandbox {

namespace {

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
    ProgramStart result;
    result.command = QStringList{program};
    if (json::flag(start, "traced"))
        result.command = traced(result.command, starts);
    const QString umask = json::text(start, "umask");
    if (!umask.isEmpty())
        result.command =
            QStringList{QStringLiteral("sh"), QStringLiteral("-c"),
                        QStringLiteral("umask %1 && exec \"$@\"").arg(umask), QStringLiteral("sh")} +
            result.command;
    for (const QString &path : json::texts(start, "read_only"))
        result.isolation << QStringLiteral("--read-only") << path;
    return result;
}

} // namespace sandbox
