// SPDX-License-Identifier: Apache-2.0
#include "insidestage.h"

#include "childprocess.h"

#include <QFile>

#include <csignal>

#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

namespace sandbox {

namespace {

const QString kMark = QStringLiteral("--inside");
const QString kReap = QStringLiteral("--reap");

QList<pid_t> children()
{
    QFile list(QStringLiteral("/proc/%1/task/%1/children").arg(::getpid()));
    QList<pid_t> result;
    if (list.open(QIODevice::ReadOnly)) {
        for (const QByteArray &pid : list.readAll().split(' ')) {
            if (pid.toInt() > 0)
                result.append(pid.toInt());
        }
    }
    return result;
}

// What was started by the command is handed to this process when its parent ends.
void endStragglers()
{
    for (QList<pid_t> left = children(); !left.isEmpty(); left = children()) {
        for (const pid_t pid : left) {
            ::kill(pid, SIGKILL);
            ::waitpid(pid, nullptr, 0);
        }
    }
}

int runAndReap(const QStringList &command)
{
    ::prctl(PR_SET_CHILD_SUBREAPER, 1);
    const pid_t child = ::fork();
    if (child == 0) {
        ::prctl(PR_SET_PDEATHSIG, SIGKILL);
        restoreSignals();
        ::_exit(becomeCommand(command));
    }
    const int code = waitForExitCode(child);
    endStragglers();
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
