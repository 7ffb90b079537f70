// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

#include "journal/hold.h"
#include "process.h"
#include "state/userunits.h"

#include <QStandardPaths>

#include <optional>

#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kTimeoutMs = 20000;

Outcome failure(const QString &text)
{
    return {1, {}, text.toUtf8() + '\n'};
}

// The tool of the machine, past the stand-in that comes first in PATH. The environment of the world leads it
// to the world's own settings and schemas.
Outcome runGsettings(const QStringList &arguments, const StateDirectory &state)
{
    QStringList directories = qEnvironmentVariable("PATH").split(QLatin1Char(':'));
    directories.removeAll(state.commands());
    const QString tool = QStandardPaths::findExecutable(QStringLiteral("gsettings"), directories);
    if (tool.isEmpty())
        return {127, {}, "gsettings: not installed on this machine\n"};
    vesk::base::Process process;
    if (!process.run(tool, arguments, kTimeoutMs))
        return {124, {}, process.complaint().toUtf8() + '\n'};
    return {process.exitStatus() == QProcess::NormalExit ? process.exitCode() : 1,
            process.readAllStandardOutput(), process.readAllStandardError()};
}

Outcome runId()
{
    const QByteArray user = QByteArray::number(::getuid());
    return {0,
            "uid=" + user + "(terminal) gid=" + user + "(terminal) groups=" + user +
                "(terminal),27(sudo),990(vesk)\n",
            {}};
}

Outcome runSystemctl(const QStringList &arguments, UserUnits &units)
{
    QStringList words = arguments;
    words.removeAll(QStringLiteral("--global"));
    if (words.size() != 2)
        return failure(QStringLiteral("usage: systemctl --global enable|disable|stop|is-enabled UNIT"));
    const QString verb = words.at(0);
    const QString unit = words.at(1);
    if (!UserUnits::names().contains(unit))
        return failure(
            QStringLiteral("Failed to %1 unit: Unit file %2.service does not exist.").arg(verb, unit));
    if (verb == QLatin1String("is-enabled")) {
        const bool enabled = units.isEnabled(unit);
        return {enabled ? 0 : 1, enabled ? "enabled\n" : "disabled\n", {}};
    }
    if (verb == QLatin1String("enable") || verb == QLatin1String("disable"))
        units.setEnabled(unit, verb == QLatin1String("enable"));
    else if (verb == QLatin1String("stop"))
        units.setRunning(unit, false);
    else
        return failure(QStringLiteral("Unknown command verb %1.").arg(verb));
    return units.save() ? Outcome{} : failure(QStringLiteral("Failed to %1 unit: cannot write").arg(verb));
}

Outcome runKillall(const QStringList &arguments, UserUnits &units)
{
    Outcome outcome;
    for (const QString &name : arguments) {
        if (name.startsWith(QLatin1Char('-')))
            continue;
        if (units.isRunning(name)) {
            units.setRunning(name, false);
            continue;
        }
        outcome.exitCode = 1;
        outcome.errors += name.toUtf8() + ": no process found\n";
    }
    return units.save() ? outcome : failure(QStringLiteral("killall: cannot write"));
}

// A scripted exit code or output stands in for the command's work, which is then not done. The services stay
// locked until the journal has the command, so that whoever sees its effect also finds its line.
Outcome perform(const QString &name, const QStringList &arguments, const StateDirectory &state,
                const QJsonObject &script, std::optional<UserUnits> *units)
{
    if (script.contains(QLatin1String("exit")) || script.contains(QLatin1String("output")))
        return {json::number(script, "exit", 0), json::text(script, "output").toUtf8(), {}};
    if (name == QLatin1String("gsettings"))
        return runGsettings(arguments, state);
    if (name == QLatin1String("id"))
        return runId();
    units->emplace(state);
    return name == QLatin1String("systemctl") ? runSystemctl(arguments, **units)
                                              : runKillall(arguments, **units);
}

} // namespace

Outcome runCommand(const QString &name, const QStringList &arguments, const StateDirectory &state,
                   const QJsonObject &script)
{
    waitAsScripted(state.journal(), QStringLiteral("command"), name + QLatin1Char(':'), 0,
                   json::flag(script, "hold"));
    std::optional<UserUnits> units;
    Outcome outcome = perform(name, arguments, state, script, &units);
    state.journal().write(QStringLiteral("command"),
                          QStringLiteral("%1 -> exit %2")
                              .arg((QStringList{name} + arguments).join(QLatin1Char(' ')))
                              .arg(outcome.exitCode));
    return outcome;
}

} // namespace sandbox
