// SPDX-License-Identifier: Apache-2.0
#include "userservices.h"

#include "journal/error.h"

#include "state/userunits.h"

namespace sandbox {

UserServices::UserServices(const StateDirectory &state)
    : m_state(state)
{
    connect(&m_watcher, &QFileSystemWatcher::directoryChanged, this, &UserServices::followUnits);
}

void UserServices::start(const QProcessEnvironment &environment)
{
    UserUnits units(m_state);
    for (const QString &unit : UserUnits::names()) {
        units.setEnabled(unit, units.isEnabled(unit)); // both are in the file from the start
        units.setRunning(unit, units.isEnabled(unit));
        if (!units.isEnabled(unit))
            continue;
        auto process = std::make_unique<Child>(m_state.at("world.log"));
        process->startIn(environment, m_state.commands() + QLatin1Char('/') + unit);
        m_processes[unit] = std::move(process);
        note(unit, "has started");
    }
    m_watcher.addPath(m_state.path());
    if (!units.save())
        throw Error(QStringLiteral("cannot write %1").arg(m_state.units()));
}

void UserServices::stop()
{
    if (!m_watcher.directories().isEmpty())
        m_watcher.removePaths(m_watcher.directories());
    m_processes.clear();
    UserUnits units(m_state);
    for (const QString &unit : UserUnits::names())
        units.setRunning(unit, false);
    units.save();
}

void UserServices::followUnits()
{
    const UserUnits units(m_state);
    for (auto process = m_processes.begin(); process != m_processes.end();) {
        if (units.isRunning(process->first)) {
            ++process;
            continue;
        }
        process->second->end();
        note(process->first, "has ended");
        process = m_processes.erase(process);
    }
}

void UserServices::note(const QString &unit, const char *what) const
{
    m_state.journal().write(QStringLiteral("world"),
                            QStringLiteral("the user's service %1 %2").arg(unit, QLatin1String(what)));
}

} // namespace sandbox
