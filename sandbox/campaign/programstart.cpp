// SPDX-License-Identifier: Apache-2.0
#include "campaign/programstart.h"

#include "scenario/strictobject.h"

namespace sandbox {

namespace {

constexpr int kMostTmpKb = 1024;
constexpr int kMostJoins = 1000;

} // namespace

ProgramStart programStart(const QJsonObject &start, const QString &program)
{
    StrictObject strict(start, QStringLiteral("start"));
    ProgramStart result;
    result.command = QStringList{program};
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
