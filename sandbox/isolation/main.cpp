// SPDX-License-Identifier: Apache-2.0
#include "backend.h"
#include "childprocess.h"
#include "insidestage.h"
#include "isolationoptions.h"
#include "runfolder.h"
#include "view.h"

#include <QCoreApplication>
#include <QFileInfo>

#include <csignal>
#include <cstdio>

#include <sys/prctl.h>
#include <unistd.h>

namespace {

using namespace sandbox;

// Exit codes of our own are out of the way of most commands'.
constexpr int kUsageError = 125;

int fail(const QString &reason)
{
    std::fprintf(stderr, "vesk-isolate: %s\n", qPrintable(reason));
    return kUsageError;
}

// The machine's buses are not the command's; its temporary folder is /tmp, wherever ours is.
void setEnvironment(const IsolationOptions &options)
{
    qunsetenv("TMPDIR");
    for (const char *bus : {"DBUS_SESSION_BUS_ADDRESS", "DBUS_SYSTEM_BUS_ADDRESS"})
        qputenv(bus, "unix:path=/nonexistent");
    for (const auto &variable : options.environment)
        qputenv(variable.first.toLocal8Bit().constData(), variable.second.toLocal8Bit());
}

InsideStage stageFor(const IsolationOptions &options, const Backend &backend, const RunFolder &folder)
{
    InsideStage stage;
    stage.reap = !backend.endsStragglers();
    for (const QString &path : View::copies()) {
        if (!QFileInfo::exists(folder.root() + path))
            stage.absent.append(path);
    }
    stage.command = options.command;
    return stage;
}

int isolate(const IsolationOptions &options)
{
    QString error;
    RunFolder folder(options.root);
    if (!folder.prepare(&error))
        return fail(error);
    const auto backend = Backend::choose(options.backend, &error);
    if (!backend)
        return fail(error);
    const QStringList stage = QStringList{QCoreApplication::applicationFilePath()} +
                              stageFor(options, *backend, folder).toArguments();
    const View view(options, folder);
    folder.forgetMountPoints(view.mountPoints());
    const QStringList command = backend->commandLine(view, folder, stage);
    setEnvironment(options);
    return runForwardingSignals(command, [&backend] { return backend->enter(); });
}

} // namespace

int main(int argc, char **argv)
{
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    const QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments().mid(1);
    InsideStage stage;
    if (InsideStage::parse(arguments, &stage))
        return stage.run();

    IsolationOptions options;
    QString error;
    if (!IsolationOptions::parse(arguments, &options, &error))
        return fail(error + QLatin1Char('\n') + IsolationOptions::usage());
    return isolate(options);
}
