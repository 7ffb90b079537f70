// SPDX-License-Identifier: Apache-2.0
#include "insidestage.h"

#include "childprocess.h"
#include "guard.h"

#include <QCoreApplication>
#include <QFile>

namespace sandbox {

namespace {

const QString kBecome = QStringLiteral("--inside");
const QString kReap = QStringLiteral("--inside-reap");
const QString kEnd = QStringLiteral("--");

int becomeFresh(const QStringList &command)
{
    restoreSignals();
    return becomeCommand(command);
}

} // namespace

QStringList insideStage(bool reap, const QStringList &absent, const QStringList &command)
{
    return QStringList{QCoreApplication::applicationFilePath(), reap ? kReap : kBecome} + absent +
           QStringList{kEnd} + command;
}

std::optional<int> runInsideStage(const QStringList &arguments)
{
    const QString mode = arguments.value(1);
    if (mode != kBecome && mode != kReap)
        return std::nullopt;
    const auto end = arguments.indexOf(kEnd);
    for (const QString &path : arguments.mid(2, end - 2))
        QFile::remove(path);
    const QStringList command = arguments.mid(end + 1);
    if (mode == kBecome)
        return becomeFresh(command);
    adoptOrphans();
    const int code = waitForExitCode(startChild([&command] { return becomeFresh(command); }));
    endChildren();
    return code;
}

} // namespace sandbox
