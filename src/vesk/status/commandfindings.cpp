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
        return {key, State::Unknown, QJsonValue::Null, Text::tr("systemctl cannot be run"), {}};
    const bool isNeeded = joined.value_or(false);
    const QString state = output->trimmed();
    if (state.isEmpty())
        return {key, isNeeded ? State::Fault : State::None, QStringLiteral("not-installed"),
                Text::tr("is not installed"), isNeeded ? Text::tr("install its package") : QString()};
    if (state == QLatin1String("enabled"))
        return {key, isNeeded ? State::Ok : State::None, state, Text::tr("is enabled for all users"), {}};
    return {key, isNeeded ? State::Fault : State::None, state, Text::tr("is not enabled: %1").arg(state),
            isNeeded ? QStringLiteral("systemctl --global enable %1").arg(name) : QString()};
}

// By the words that the enrolment program looks for.
Finding rightsFinding()
{
    const QString key = QStringLiteral("may-leave");
    const auto output = outputOf(QStringLiteral("id"), {});
    if (!output)
        return {key, State::Unknown, QJsonValue::Null, Text::tr("id cannot be run"), {}};
    const bool may = output->contains(QLatin1String("sudo")) && output->contains(QLatin1String("vesk"));
    return {key, State::None, may,
            may ? Text::tr("this user may take the terminal out of the domain")
                : Text::tr("this user may not take the terminal out of the domain"),
            may ? QString() : Text::tr("who may is in the groups sudo and vesk")};
}

} // namespace

Findings commandFindings(Joined joined)
{
    return {unitFinding("vesks", joined), unitFinding("mmcs", joined), rightsFinding()};
}
