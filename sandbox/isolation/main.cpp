// SPDX-License-Identifier: Apache-2.0
#include "backend.h"
#include "childprocess.h"
#include "guard.h"
#include "isolationoptions.h"
#include "rundirectory.h"
#include "view.h"

#include "journal/commandline.h"
#include "journal/error.h"

#include <QCoreApplication>
#include <QFile>

#include <csignal>
#include <optional>

#include <sys/prctl.h>

namespace {

using namespace sandbox;

// Exit codes of our own are out of the way of most commands'.
constexpr int kUsageError = 125;

// The first process inside the isolation is vesk-isolate once more, called by the isolation tool. It takes
// away files that are to be absent, starts the command with the signals' usual meaning restored, and ends the
// children that outlive it.
const QString kInside = QStringLiteral("--inside");
const QString kEnd = QStringLiteral("--");

// Nothing when it is not called so; else the exit code for the process: the command's, 128 + signal, 126 or
// 127.
std::optional<int> runInside(const QStringList &arguments)
{
    if (arguments.value(1) != kInside)
        return std::nullopt;
    const auto end = arguments.indexOf(kEnd);
    for (const QString &path : arguments.mid(2, end - 2))
        QFile::remove(path);
    adoptOrphans();
    const int code = waitForExitCode(startChild([&] {
        restoreSignals();
        return becomeCommand(arguments.mid(end + 1));
    }));
    endChildren();
    return code;
}

// The machine's buses are not the command's; its temporary directory is /tmp, wherever ours is.
void setEnvironment(const IsolationOptions &options)
{
    qunsetenv("TMPDIR");
    for (const char *bus : {"DBUS_SESSION_BUS_ADDRESS", "DBUS_SYSTEM_BUS_ADDRESS"})
        qputenv(bus, "unix:path=/nonexistent");
    for (const auto &variable : options.environment)
        qputenv(variable.first.toLocal8Bit().constData(), variable.second.toLocal8Bit());
}

// Returns the exit code of the command; throws an Error.
int isolate(const QStringList &arguments)
{
    const IsolationOptions options = IsolationOptions::parse(arguments);
    RunDirectory run(options.root);
    run.prepare();
    const auto backend = Backend::choose(options.backend);
    const View view(options, run);
    run.forgetMountPoints(view.mountPoints());
    const QStringList stage = QStringList{QCoreApplication::applicationFilePath(), kInside} + view.absent() +
                              QStringList{kEnd} + options.command;
    const QStringList command = backend->commandLine(view, run, stage);
    setEnvironment(options);
    return runForwardingSignals(command, [&backend] { return backend->enter(); });
}

} // namespace

int main(int argc, char **argv)
{
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    const QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    if (const std::optional<int> code = runInside(arguments))
        return *code;

    try {
        return isolate(arguments);
    } catch (const Error &error) {
        return commandline::fail(error.text(), kUsageError);
    }
}
