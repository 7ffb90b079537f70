// SPDX-License-Identifier: Apache-2.0
#include "guard.h"

#include "childprocess.h"

#include "journal/smallfile.h"

#include <QList>

#include <csignal>

#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kParentDied = SIGUSR1;

QList<pid_t> children()
{
    const QString list = QStringLiteral("/proc/%1/task/%1/children").arg(::getpid());
    QList<pid_t> result;
    for (const QByteArray &pid : smallfile::read(list).value_or(QByteArray()).split(' ')) {
        if (pid.toInt() > 0)
            result.append(pid.toInt());
    }
    return result;
}

bool isIgnored(int signal)
{
    struct sigaction action = {};
    return ::sigaction(signal, nullptr, &action) == 0 && action.sa_handler == SIG_IGN;
}

sigset_t guardedSignals()
{
    sigset_t events;
    sigemptyset(&events);
    sigaddset(&events, SIGCHLD);
    sigaddset(&events, kParentDied);
    if (!isIgnored(SIGTERM))
        sigaddset(&events, SIGTERM);
    return events;
}

// Waits for the end of `child`, or until the parent is gone or asks for the end; true in the first case.
bool watch(pid_t child, const sigset_t &events)
{
    siginfo_t ended{};
    for (;;) {
        if (::waitid(P_PID, static_cast<id_t>(child), &ended, WEXITED | WNOHANG | WNOWAIT) == 0 &&
            ended.si_pid == child)
            return true;
        const int signal = ::sigwaitinfo(&events, nullptr);
        if (signal == kParentDied || signal == SIGTERM)
            return false;
    }
}

} // namespace

void adoptOrphans()
{
    ::prctl(PR_SET_CHILD_SUBREAPER, 1);
}

void endChildren()
{
    for (QList<pid_t> left = children(); !left.isEmpty(); left = children()) {
        for (const pid_t pid : left) {
            ::kill(pid, SIGKILL);
            ::waitpid(pid, nullptr, 0);
        }
    }
}

void leaveGuardBehind(const std::function<void(pid_t child)> &atEnd)
{
    const sigset_t events = guardedSignals();
    sigset_t before;
    ::sigprocmask(SIG_BLOCK, &events, &before);
    ::prctl(PR_SET_PDEATHSIG, kParentDied);
    adoptOrphans();
    const pid_t child = ::fork();
    if (child == 0) {
        ::prctl(PR_SET_PDEATHSIG, SIGKILL);
        ::sigprocmask(SIG_SETMASK, &before, nullptr);
        return;
    }
    ::close_range(3, ~0U, 0); // a reader may wait for their end
    const int code = child > 0 && watch(child, events) ? waitForExitCode(child) : 126;
    endChildren();
    if (child > 0 && atEnd)
        atEnd(child);
    ::_exit(code);
}

} // namespace sandbox
