// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "play/actions.h"
#include "play/journalwatch.h"
#include "world/world.h"

#include <QCommandLineParser>
#include <QTemporaryDir>
#include <QTemporaryFile>

namespace sandbox {

// One run of vesk-sandbox: starts the world and the program, tells the user (or the autopilot) what to type,
// and ends when the program ends, the terminal asks for a reboot, the autopilot has come to its end, or a
// signal says so. Nothing of the run is left behind but a state directory that is to be kept.
class Launcher : public QObject
{
    Q_OBJECT

public:
    // Adds the options of vesk-sandbox to `parser` and reads `arguments`. Returns one line when there is
    // something wrong with them. Help and version are shown here, which ends the process.
    static QString parse(QCommandLineParser &parser, const QStringList &arguments);

    explicit Launcher(const QCommandLineParser &options);

    // Returns the exit code: of the autopilot or of the program, 0 after a reboot, 128 + signal; 1 when the
    // run could not start.
    int run();

private:
    // All of these throw an Error.
    void check();
    void findScenario();
    void start();
    void startProgram();
    void startAutopilot();

    void printWhatToType() const;
    void onReboot();
    void onProgramEnded(int exitCode);

    QString option(const char *name) const { return m_options.value(QLatin1String(name)); }
    // join or leave; empty: a person works the window.
    QString journey() const { return option("autopilot"); }

    const QCommandLineParser &m_options;
    QString m_program;
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
};

} // namespace sandbox
