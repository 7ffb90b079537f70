// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"
#include "state/statedirectory.h"

#include <QFileSystemWatcher>

#include <map>
#include <memory>

namespace sandbox {

// The per-user services of a world as real, harmless processes of their names: those that are enabled start
// with the world, as they would when the user logs in, and end when a command of the terminal stops or kills
// them. The commands run in a process namespace of their own and reach these processes through UserUnits.
class UserServices : public QObject
{
    Q_OBJECT

public:
    explicit UserServices(const StateDirectory &state);

    // Throws an Error when an enabled one does not start.
    void start(const QProcessEnvironment &environment);
    void stop();

private:
    void followUnits();
    void note(const QString &unit, const char *what) const;

    StateDirectory m_state;
    QFileSystemWatcher m_watcher;
    std::map<QString, std::unique_ptr<Child>> m_processes; // by unit
};

} // namespace sandbox
