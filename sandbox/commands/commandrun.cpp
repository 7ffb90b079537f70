// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

#include "journal/hold.h"

#include <unistd.h>

namespace sandbox {

namespace {

Outcome perform(const QString &name, const QStringList &arguments, const StateFolder &state)
{
    if (name == QLatin1String("gsettings"))
        return runGsettings(arguments, state);
    if (name == QLatin1String("systemctl"))
        return runSystemctl(arguments, state);
    if (name == QLatin1String("killall"))
        return runKillall(arguments, state);
    return runId();
}

// A scripted exit code or output stands in for the command's work, which then is not done.
Outcome scriptedOrPerformed(const QString &name, const QStringList &arguments, const StateFolder &state,
                            const CommandScript &script)
{
    if (!script.exitCode && !script.output)
        return perform(name, arguments, state);
    return {script.exitCode.value_or(0), script.output.value_or(QString()).toUtf8(), {}};
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

Outcome runCommand(const QString &name, const QStringList &arguments, const StateFolder &state,
                   const CommandScript &script)
{
    waitAsScripted(state.journal(), QStringLiteral("command"), name + QLatin1Char(':'), script.delayMs,
                   script.isHeld);
    Outcome outcome = scriptedOrPerformed(name, arguments, state, script);
    state.journal().write(QStringLiteral("command"),
                          QStringLiteral("%1 -> exit %2")
                              .arg((QStringList{name} + arguments).join(QLatin1Char(' ')))
                              .arg(outcome.exitCode));
    return outcome;
}

} // namespace sandbox
