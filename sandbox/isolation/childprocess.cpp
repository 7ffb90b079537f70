// SPDX-License-Identifier: Apache-2.0
#include "childprocess.h"

#include <QFile>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <vector>

#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kForwarded[] = {SIGTERM, SIGINT, SIGHUP, SIGQUIT};

volatile sig_atomic_t g_group = 0;

void forward(int signal)
{
    if (g_group > 0)
        ::kill(-g_group, signal);
}

void setHandlers(void (*handler)(int))
{
    for (const int signal : kForwarded)
        ::signal(signal, handler);
}

} // namespace

pid_t startChild(const std::function<int()> &work)
{
    const pid_t child = ::fork();
    if (child == 0) {
        ::prctl(PR_SET_PDEATHSIG, SIGKILL);
        ::_exit(work());
    }
    return child;
}

int runForwardingSignals(const QStringList &command, const std::function<bool()> &beforeExec)
{
    // Signals stay pending until they are forwarded.
    sigset_t all;
    sigset_t before;
    sigfillset(&all);
    ::sigprocmask(SIG_BLOCK, &all, &before);
    const pid_t child = startChild([&] {
        ::setsid();
        setHandlers(SIG_IGN);
        ::sigprocmask(SIG_SETMASK, &before, nullptr);
        return beforeExec() ? becomeCommand(command) : 126;
    });
    if (child > 0) {
        g_group = child;
        setHandlers(forward);
    }
    ::sigprocmask(SIG_SETMASK, &before, nullptr);
    const int code = waitForExitCode(child);
    g_group = 0;
    return code;
}

void restoreSignals()
{
    setHandlers(SIG_DFL);
}

int becomeCommand(const QStringList &command)
{
    std::vector<QByteArray> texts;
    texts.reserve(static_cast<size_t>(command.size()));
    for (const QString &argument : command)
        texts.push_back(QFile::encodeName(argument));
    std::vector<char *> arguments;
    arguments.reserve(texts.size() + 1);
    for (QByteArray &text : texts)
        arguments.push_back(text.data());
    arguments.push_back(nullptr);
    ::execvp(arguments.front(), arguments.data());
    const int reason = errno;
    std::fprintf(stderr, "vesk-isolate: cannot run %s: %s\n", arguments.front(), std::strerror(reason));
    return reason == ENOENT ? 127 : 126;
}

int waitForExitCode(pid_t child)
{
    int status = 0;
    while (::waitpid(child, &status, 0) < 0) {
        if (errno != EINTR)
            return 126;
    }
    return WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status);
}

} // namespace sandbox
