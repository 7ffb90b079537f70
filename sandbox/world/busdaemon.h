// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"
#include "state/statedirectory.h"

namespace sandbox {

// A private message bus: a real dbus-daemon with a configuration of ours, which starts no service of the
// machine.
class BusDaemon
{
public:
    // name: of the socket in the world's runtime directory; the configuration is written beside it.
    BusDaemon(QString type, QString name, const StateDirectory &state);

    // Before start(): names that may not be called, and names that the bus would start a service for, which
    // then ends at once.
    void deny(const QStringList &names) { m_denied = names; }
    void failActivation(const QStringList &names) { m_failing = names; }

    void start(); // throws an Error
    // As start(). From then on each call of a method but those to the bus itself is in the journal, whether
    // anybody answers it or not: "monitor SERVICE INTERFACE.MEMBER".
    void startRecorded();
    void stop();
    bool isRunning() const { return m_daemon.state() == QProcess::Running; }
    // The running bus denies no call any more once this returns. Throws an Error.
    void allowAll();

    // As in DBUS_SESSION_BUS_ADDRESS.
    QString address() const;

private:
    void recordCalls();
    void writeConfiguration() const;
    void writeActivation() const;
    QString socket() const { return m_state.run() + QLatin1Char('/') + m_name; }
    QString configuration() const { return socket() + QStringLiteral(".conf"); }
    QString serviceDirectory() const { return socket() + QStringLiteral(".services"); }

    QString m_type; // "session" or "system"
    QString m_name;
    StateDirectory m_state;
    QStringList m_denied;
    QStringList m_failing;
    Child m_daemon;
    Child m_monitor;
};

} // namespace sandbox
