// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

namespace sandbox {

namespace {

Outcome failure(const QString &text)
{
    return {1, {}, text.toUtf8() + '\n'};
}

Outcome apply(const QString &verb, const QString &unit, UserUnits &units)
{
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

} // namespace

Outcome runSystemctl(const QStringList &arguments, UserUnits &units)
{
    QStringList words = arguments;
    words.removeAll(QStringLiteral("--global"));
    if (words.size() != 2)
        return failure(QStringLiteral("usage: systemctl --global enable|disable|stop|is-enabled UNIT"));
    return apply(words.at(0), words.at(1), units);
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

} // namespace sandbox
