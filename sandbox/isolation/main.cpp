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

namespace {

using namespace sandbox;

// Exit codes of our own are out of the way of most commands'.
constexpr int kUsageError = 125;

// The machine's buses are not the command's; its temporary directory is /tmp, wherever ours is.
void setEnvironment(const IsolationOptions &options)
{
    qunsetenv("TMPDIR");
    for (const char *bus : {"DBUS_SESSION_BUS_ADDRESS", "DBUS_SYSTEM_BUS_ADDRESS"})
        qputenv(bus, "unix:path=/nonexistent");
    for (const auto &variable : options.environment)
        qputenv(variable.first.toLocal8Bit().constData(), variable.second.toLocal8Bit());
}

// False with one line in `error`.
bool isolate(const QStringList &arguments, int *exitCode, QString *error)
{
    IsolationOptions options;
    if (!IsolationOptions::parse(arguments, &options, error))
        return false;
    RunFolder folder(options.root);
    if (!folder.prepare(error))
        return false;
    const auto backend = Backend::choose(options.backend, error);
    if (!backend)
        return false;
    QStringList absent;
    for (const QString &path : View::copies()) {
        if (!QFileInfo::exists(folder.root() + path))
            absent.append(path);
    }
    const View view(options, folder);
    folder.forgetMountPoints(view.mountPoints());
    const QStringList command =
        backend->commandLine(view, folder, insideStage(!backend->endsStragglers(), absent, options.command));
    setEnvironment(options);
    *exitCode = runForwardingSignals(command, [&backend] { return backend->enter(); });
    return true;
}

} // namespace

int main(int argc, char **argv)
{
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    const QCoreApplication application(argc, argv);
    QCoreApplication::setApplicationVersion(QStringLiteral(VESK_VERSION));
    const QStringList arguments = QCoreApplication::arguments();
    if (const std::optional<int> code = runInsideStage(arguments))
        return *code;

    int exitCode = kUsageError;
    QString error;
    if (!isolate(arguments, &exitCode, &error))
        std::fprintf(stderr, "vesk-isolate: %s\n", qPrintable(error));
    return exitCode;
}
