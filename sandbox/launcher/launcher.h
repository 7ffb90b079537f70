// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "play/actions.h"
#include "play/journalwatch.h"
#include "world/unixsignals.h"
#include "world/world.h"

#include <QTemporaryDir>
#include <QTemporaryFile>

namespace sandbox {

// The command line of vesk-sandbox, for the start of a world.
struct LauncherOptions
{
    QString state; // empty: a temporary directory
    QString scenario;
    bool headless = false;
    QString journey; // join or leave; empty: a person works the window
    QString program; // empty: veskw beside this program
    quint16 port = 0;
    QString screenshots; // empty: in the state directory
    bool keep = false;

    // Returns one line when there is something wrong with them. Help and version are shown here, which
    // ends the process.
    QString parse(const QStringList &arguments);
};

// One run of vesk-sandbox: starts the world and the program, tells the user (or the autopilot) what to type,
// and ends when the program ends, the terminal asks for a reboot, the autopilot has come to its end, or a
// signal says so. Nothing of the run is left behind but a state directory that is to be kept.
class Launcher : public QObject
{
    Q_OBJECT

public:
    explicit Launcher(const LauncherOptions &options);

    // Returns the exit code: of the autopilot or of the program, 0 after a reboot, 128 + signal; 1 when the
    // run could not start.
    int run();

private:
    bool check(QString *error);
    bool findScenario(QString *error);
    bool makeWorldFor(const QJsonObject &scenario, QString *error);
    bool start(QString *error);
    bool startProgram(QString *error);
    bool startAutopilot(QString *error);
    void printWhatToType() const;
    void onReboot();
    void onProgramEnded(int exitCode);
    void onAutopilotEnded(int exitCode, QProcess::ExitStatus status);

    LauncherOptions m_options;
    std::unique_ptr<QTemporaryDir> m_temporary; // null when a state directory is given
    QString m_statePath;
    QString m_scenarioFile;
    QTemporaryFile m_rowFile;
    int m_smallTmp = 0; // kilobytes; 0: /tmp is as large as the disk
    std::unique_ptr<World> m_world;
    std::unique_ptr<SyscallFault> m_fault;
    std::unique_ptr<Actions> m_actions;
    std::unique_ptr<JournalWatch> m_journal;
    std::unique_ptr<Child> m_autopilot;
    UnixSignals m_signals;
};

} // namespace sandbox
