// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// The command line of vesk-sandbox, for the start of a world.
struct LauncherOptions
{
    QString state; // empty: a temporary folder
    QString scenario = QStringLiteral("join-ok");
    bool headless = false;
    QString journey; // join or leave; empty: a person works the window
    QString program; // empty: veskw beside this program
    quint16 port = 0;
    QString pictures; // empty: in the state folder
    bool keep = false;

    // Returns one line when there is something wrong with them. Help is shown here, and ends the process.
    QString parse(const QStringList &arguments);
};

} // namespace sandbox
