// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

#include <QProcess>
#include <QStandardPaths>

namespace sandbox {

namespace {

constexpr int kLimitMs = 20000;

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
    QProcess process;
    process.start(tool, arguments);
    if (!process.waitForFinished(kLimitMs)) {
        process.kill();
        process.waitForFinished(kLimitMs);
        return {124, {}, "gsettings: does not end\n"};
    }
    return {process.exitStatus() == QProcess::NormalExit ? process.exitCode() : 1,
            process.readAllStandardOutput(), process.readAllStandardError()};
}

} // namespace sandbox
