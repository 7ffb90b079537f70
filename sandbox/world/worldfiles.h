// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "scenario/scenario.h"
#include "state/statedirectory.h"

namespace sandbox {

// The files of a world before anything runs in it. A new state directory is filled like a machine that was
// just installed, with the scenario's files on top; an old one keeps what is in it. Settings schemas,
// stand-in commands and the copy of the scenario are made again at each start. Throws an Error.
class WorldFiles
{
public:
    WorldFiles(StateDirectory state, QString scenarioFile)
        : m_state(std::move(state))
        , m_scenarioFile(std::move(scenarioFile))
    {
    }

    // The directory must be empty, absent or hold a world; anything else is left alone.
    static void refuseUnusable(const QString &path);

    void prepare(const Scenario &scenario) const;

    // Services and commands that look at the scenario from now on find one in which all goes well.
    void forgetScenario() const;

    // What a reboot does to the files of a machine.
    void emptyTmp() const;

    // Gives the desktop the settings of a new machine.
    void writeSettings() const;

private:
    void makeDirectories() const;
    void populate() const;
    void linkCommands() const;

    StateDirectory m_state;
    QString m_scenarioFile;
};

} // namespace sandbox
