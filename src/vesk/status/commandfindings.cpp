// SPDX-License-Identifier: Apache-2.0
// What commands tell: per-user services, and the groups of this user.
#include "collectors.h"

#include "command.h"

namespace {

Finding unitFinding(const char *unit, Joined joined)
{
    const QString name = QLatin1String(unit);
    const QString key = QStringLiteral("user-service:") + name;
    const auto output = outputOf(QStringLiteral("systemctl"),
                                 {QStringLiteral("--global"), QStringLiteral("is-enabled"), name});
    if (!output)
        return Finding::unknown(key, Text::tr("systemctl cannot be run"));
    const bool isInstalled = !output->isEmpty();
    const QString state = isInstalled ? output->trimmed() : QStringLiteral("not-installed");
    const bool isEnabled = state == QLatin1String("enabled");
    const QString text = isEnabled     ? Text::tr("is enabled for all users")
                         : isInstalled ? Text::tr("is not enabled: %1").arg(state)
                                       : Text::tr("is not installed");
    if (!joined.value_or(false))
        return Finding::none(key, state, text);
    if (isEnabled)
        return Finding::ok(key, state, text);
    return Finding::fault(key, state, text,
                          isInstalled ? QStringLiteral("systemctl --global enable %1").arg(name)
                                      : Text::tr("install its package"));
}

// By the words that the enrolment program looks for.
Finding rightsFinding()
{
    const QString key = QStringLiteral("may-leave");
    const auto output = outputOf(QStringLiteral("id"), {});
    if (!output)
        return Finding::unknown(key, Text::tr("id cannot be run"));
    const bool may = output->contains(QLatin1String("sudo")) && output->contains(QLatin1String("vesk"));
    if (may)
        return Finding::none(key, true, Text::tr("this user may take the terminal out of the domain"));
    return Finding::none(key, false, Text::tr("this user may not take the terminal out of the domain"),
                         Text::tr("who may is in the groups sudo and vesk"));
}

} // namespace

Findings commandFindings(Joined joined)
{
    return {unitFinding("vesks", joined), unitFinding("mmcs", joined), rightsFinding()};
}
