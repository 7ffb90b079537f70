// SPDX-License-Identifier: Apache-2.0
#include "insidestage.h"

#include "childprocess.h"
#include "guard.h"

#include <QFile>

#include <csignal>

#include <sys/prctl.h>
#include <unistd.h>

namespace sandbox {

namespace {

const QString kMark = QStringLiteral("--inside");
const QString kReap = QStringLiteral("--reap");

int runAndReap(const QStringList &command)
{
    adoptOrphans();
    const pid_t child = ::fork();
    if (child == 0) {
        ::prctl(PR_SET_PDEATHSIG, SIGKILL);
        restoreSignals();
        ::_exit(becomeCommand(command));
    }
    const int code = waitForExitCode(child);
    endChildren();
    return code;
}

} // namespace

QStringList InsideStage::toArguments() const
{
    QStringList arguments{kMark};
    if (reap)
        arguments << kReap;
    return arguments + absent + QStringList{QStringLiteral("--")} + command;
}

bool InsideStage::parse(const QStringList &arguments, InsideStage *stage)
{
    if (arguments.isEmpty() || arguments.first() != kMark)
        return false;
    const auto end = arguments.indexOf(QStringLiteral("--"));
    const QStringList options = arguments.mid(1, end - 1);
    stage->reap = options.contains(kReap);
    for (const QString &option : options) {
        if (option != kReap)
            stage->absent.append(option);
    }
    stage->command = arguments.mid(end + 1);
    return true;
}

int InsideStage::run() const
{
    for (const QString &path : absent)
        QFile::remove(path);
    if (reap)
        return runAndReap(command);
    restoreSignals();
    return becomeCommand(command);
}

} // namespace sandbox
