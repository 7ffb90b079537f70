// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

#include "journal/hold.h"

#include <unistd.h>

namespace sandbox {

namespace {

// The services stay locked until the journal has the command, so that whoever sees its effect also finds its
// line.
Outcome perform(const QString &name, const QStringList &arguments, const StateDirectory &state,
                std::optional<UserUnits> *units)
{
    if (name == QLatin1String("gsettings"))
        return runGsettings(arguments, state);
    if (name == QLatin1String("id"))
        return runId();
    units->emplace(state);
    return name == QLatin1String("systemctl") ? runSystemctl(arguments, **units)
                                              : runKillall(arguments, **units);
}

// A scripted exit code or output stands in for the command's work, which is then not done.
Outcome scriptedOrPerformed(const QString &name, const QStringList &arguments, const StateDirectory &state,
                            const QJsonObject &script, std::optional<UserUnits> *units)
{
    if (!script.contains(QLatin1String("exit")) && !script.contains(QLatin1String("output")))
        return perform(name, arguments, state, units);
    return {json::number(script, "exit", 0), json::text(script, "output").toUtf8(), {}};
}

} // namespace

Outcome runId()
{
    const QByteArray user = QByteArray::number(::getuid());
    return {0,
            "uid=" + user + "(terminal) gid=" + user + "(terminal) groups=" + user +
                "(terminal),27(sudo),990(vesk)\n",
            {}};
}

Outcome runCommand(const QString &name, const QStringList &arguments, const StateDirectory &state,
                   const QJsonObject &script)
{
    waitAsScripted(state.journal(), QStringLiteral("command"), name + QLatin1Char(':'),
                   json::number(script, "delay_ms", 0), json::flag(script, "hold"));
    std::optional<UserUnits> units;
    Outcome outcome = scriptedOrPerformed(name, arguments, state, script, &units);
    state.journal().write(QStringLiteral("command"),
                          QStringLiteral("%1 -> exit %2")
                              .arg((QStringList{name} + arguments).join(QLatin1Char(' ')))
                              .arg(outcome.exitCode));
    return outcome;
}

} // namespace sandbox
