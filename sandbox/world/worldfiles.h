// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

namespace sandbox {

// The files of a world before anything runs in it. A new state directory is filled like a machine that was
// just installed, with the scenario's files on top; an old one keeps what is in it. Settings schemas,
// stand-in commands and the copy of the scenario are made again at each start.
class WorldFiles
{
public:
    WorldFiles(StateDirectory state, QString scenarioFile)
        : m_state(std::move(state))
        , m_scenarioFile(std::move(scenarioFile))
    {
    }

    // True when the directory is empty, absent or holds a world; anything else is left
    // alone.
    static bool isUsable(const QString &path, QString *error);

    bool prepare(const Scenario &scenario, QString *error) const;

    // Services and commands that look at the scenario from now on find one in which all goes well.
    bool forgetScenario(QString *error) const;

    // What a reboot does to the files of a machine.
    void emptyTmp() const;

private:
    bool makeDirectories(QString *error) const;
    bool populate(const Scenario &scenario, QString *error) const;
    bool writeSettings(QString *error) const;
    bool writeScenarioFiles(const Scenario &scenario, QString *error) const;
    bool linkCommands(QString *error) const;
    bool copyScenario(QString *error) const;

    StateDirectory m_state;
    QString m_scenarioFile;
};

} // namespace sandbox
