// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "accessibility.h"
#include "busdaemon.h"
#include "child.h"
#include "display.h"
#include "journal/hold.h"
#include "runtimedirectory.h"
#include "scenario/scenario.h"
#include "state/statedirectory.h"
#include "userservices.h"

#include <QLockFile>

#include <memory>
#include <optional>
#include <vector>

namespace sandbox {

class ManagementServer;

// What kind of world is wanted.
struct WorldOptions
{
    QString state;        // directory; may be new
    QString scenarioFile; // path
    quint16 port = 0;     // of the enrolment address; 0: the one chosen at the first start
    bool virtualDisplay = false;
    bool accessible = false;        // windows can be worked from outside; needs a display
    bool separateReaderBus = false; // the accessibility bus does not depend on the session bus, which may die
};

// An enrolment world on this machine: management server, private buses with the services on them, and the
// files, commands and settings that a program inside sees. Used by the launcher and, in-process, by tests;
// needs a QCoreApplication and belongs to its main thread. Everything is in the state directory and ends with
// stop(), at the latest with this object or this process; one world at a time has a state directory.
class World : public QObject
{
    Q_OBJECT

public:
    explicit World(const WorldOptions &options);
    ~World() override;

    // Each part has a limit of some seconds to get ready. Where something cannot be started or repaired, here
    // and below, an Error is thrown; here, what had started is stopped again.
    void start();
    void stop();

    // Starts a program inside, unmodified and isolated; its output goes to StateDirectory::programLog().
    // `isolation`: further options of vesk-isolate.
    void startProgram(const QStringList &command, const QStringList &isolation = {});
    // The same for a process of the caller's.
    void startProcess(Child *child, const QStringList &command, const QStringList &isolation = {});
    Child &program() { return m_program; }
    // Ends the program and does to the files what a reboot does.
    void reboot();

    // Everything behaves from now on, as in a scenario without a word about server, services and commands:
    // what had ended is started again.
    void repair();
    // From outside, while the program runs.
    void stopSessionBus() { m_sessionBus.stop(); }
    void stopSystemBus() { m_systemBus.stop(); }
    void stopDisplay() { m_display.stop(); }
    // New ones in place of those that were stopped, with all services.
    void renewDisplay();
    void renewBuses();
    // Lets one held call go on.
    void release()
    {
        if (m_hold)
            m_hold->release();
    }
    // Ends all connections of the server, in the middle of a reply if need be.
    void dropConnections();

    const StateDirectory &state() const { return m_state; }
    const Scenario &scenario() const { return m_scenario; }
    quint16 enrolmentPort() const;
    quint16 managedPort() const;
    // Of every process of the world: home, buses, commands, settings, display.
    QProcessEnvironment environment() const;
    // As what the program presents itself to its user, and so to the accessibility interface.
    static QString programName();
    QString readerBusAddress() const { return m_accessibility.address(); } // of that interface
    // Of a process that works the windows.
    QProcessEnvironment readerEnvironment() const;

Q_SIGNALS:
    void programEnded(int exitCode);
    void rebootAsked();

private:
    // All of these throw an Error.
    void prepareFiles();
    void startParts();
    void startBuses();
    void startServices();
    void startService(const QString &name);
    void startAccessibility();

    // name: empty for all.
    void stopServices(const QString &name = {});
    void followService(const QString &name);
    void reportEnd(int exitCode);

    WorldOptions m_options;
    StateDirectory m_state;
    Scenario m_scenario;
    QLockFile m_lock; // ends with the process
    RuntimeDirectory m_runtime;
    std::optional<Hold> m_hold; // while it runs
    std::unique_ptr<ManagementServer> m_server;
    BusDaemon m_sessionBus;
    BusDaemon m_systemBus;
    BusDaemon m_readerBus;                          // of the accessibility interface, where it is apart
    std::vector<std::unique_ptr<Child>> m_services; // named as they are
    Display m_display;
    Accessibility m_accessibility;
    UserServices m_userServices;
    Child m_program;
    bool m_running = false;
};

} // namespace sandbox
