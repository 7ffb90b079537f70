// SPDX-License-Identifier: Apache-2.0
#include "commands.h"

#include "process.h"

#include <QDebug>

#include <cstdlib>

#include <sys/wait.h>

namespace commands {

const char kKillOlderService[] = "killall -9  mmcs";

namespace {

using vesk::base::Process;

constexpr int kTimeoutMs = 30000;
constexpr int kNotRun =
    127; // the exit code where there is no shell, and of a shell that does not find a command

void run(Process &process, const QString &program, const QStringList &arguments)
{
    if (!process.run(program, arguments, kTimeoutMs))
        qWarning().noquote() << process.complaint();
}

} // namespace

QString userIdentity()
{
    Process process;
    run(process, QStringLiteral("id"), {});
    return QString::fromLocal8Bit(process.readAllStandardOutput().constData());
}

void hideLoginSwitches()
{
    const QString gsettings = QStringLiteral("gsettings");
    const QString set = QStringLiteral("set");
    const QString schema = QStringLiteral("com.morvek.mde.control-center");
    const QString off = QStringLiteral("false");
    Process process;
    run(process, gsettings, {set, schema, QStringLiteral("auto-login-visable"), off});
    run(process, gsettings, {set, schema, QStringLiteral("nopasswd-login-visable"), off});
}

void enableUserServices()
{
    // The shell takes the line apart at its semicolon. A constant text; what the commands return is of no use
    // to anybody.
    const int status =
        std::system("systemctl --global enable vesks;systemctl --global enable mmcs"); // NOLINT
    if (status == -1 || (WIFEXITED(status) && WEXITSTATUS(status) == kNotRun))
        qWarning() << "cannot run systemctl to enable vesks and mmcs";
}

void stopUserServices()
{
    for (const char *service : {"vesks", "mmcs"}) {
        for (const char *verb : {"stop", "disable"}) {
            Process process;
            if (!process.launch(
                    QStringLiteral("systemctl"),
                    {QStringLiteral("--global"), QString::fromLatin1(verb), QString::fromLatin1(service)}))
                qWarning().noquote() << process.complaint();
        }
    }
}

int killOlderService()
{
    QStringList words = QProcess::splitCommand(QString::fromLatin1(kKillOlderService));
    const QString program = words.takeFirst();
    Process process;
    const int code = process.execute(program, words);
    if (code == Process::kNotStarted)
        qWarning().noquote() << process.complaint();
    return code;
}

} // namespace commands
