// SPDX-License-Identifier: Apache-2.0
#include "campaign/checks/worldholds.h"

#include "journal/smallfile.h"
#include "scenario/json.h"
#include "state/userunits.h"

#include <QFile>
#include <QJsonArray>

#include <algorithm>

namespace sandbox {

namespace {

bool isKnown(const StateFolder &state)
{
    QFile machine(state.inside(QStringLiteral("/usr/share/vesk/machine.txt")));
    if (!machine.open(QIODevice::ReadOnly))
        return false;
    const QString id = QString::fromUtf8(machine.readAll()).trimmed();
    const QJsonArray terminals = smallfile::readObject(state.at("server/config.json"))
                                     .value(QLatin1String("known_terminals"))
                                     .toArray();
    return std::any_of(terminals.begin(), terminals.end(), [&id](const QJsonValue &each) {
        return each.toObject().value(QLatin1String("machine_id")).toString() == id;
    });
}

bool hasIdentity(const StateFolder &state)
{
    return smallfile::readObject(state.identityService()).value(QLatin1String("Enable")).toBool();
}

bool hasServices(const StateFolder &state)
{
    const UserUnits units(state);
    const QStringList names = UserUnits::names();
    return std::all_of(names.begin(), names.end(),
                       [&units](const QString &unit) { return units.isEnabled(unit); });
}

} // namespace

QStringList worldHolds(const StateFolder &state, const QJsonObject &expected)
{
    QStringList result;
    const auto compare = [&](const char *key, bool (*look)(const StateFolder &)) {
        const bool seen = look(state);
        const bool wanted = json::flag(expected, key, seen);
        if (wanted != seen)
            result.append(QStringLiteral("world, %1: expected %2, seen %3")
                              .arg(QLatin1String(key))
                              .arg(wanted)
                              .arg(seen));
    };
    compare("known", isKnown);
    compare("identity", hasIdentity);
    compare("services", hasServices);
    return result;
}

} // namespace sandbox
