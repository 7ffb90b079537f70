// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

#include "process.h"

#include <QStandardPaths>

namespace sandbox {

namespace {

constexpr int kTimeoutMs = 20000;

// The tool of the machine, past the stand-in that comes first in PATH.
QString realTool(const StateDirectory &state)
{
    QStringList directories = qEnvironmentVariable("PATH").split(QLatin1Char(':'));
    directories.removeAll(state.commands());
    return QStandardPaths::findExecutable(QStringLiteral("gsettings"), directories);
}

} // namespace

// The environment of the world leads the real tool to the world's own settings and schemas.
Outcome runGsettings(const QStringList &arguments, const StateDirectory &state)
{
    const QString tool = realTool(state);
    if (tool.isEmpty())
        return {127, {}, "gsettings: not installed on this machine\n"};
    vesk::base::Process process;
    if (!process.run(tool, arguments, kTimeoutMs))
        return {124, {}, process.complaint().toUtf8() + '\n'};
    return {process.exitStatus() == QProcess::NormalExit ? process.exitCode() : 1,
            process.readAllStandardOutput(), process.readAllStandardError()};
}

} // namespace sandbox
