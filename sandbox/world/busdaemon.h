// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"

namespace sandbox {

// A private message bus: a real dbus-daemon with a configuration of ours, which starts no service of the
// machine.
class BusDaemon
{
public:
    // socket: path of the socket; the configuration is written beside it.
    BusDaemon(QString type, QString socket, const QString &errorLog);

    bool start(QString *error);
    void stop() { m_daemon.end(); }

    // As in DBUS_SESSION_BUS_ADDRESS.
    QString address() const;

private:
    bool writeConfiguration(const QString &path) const;

    QString m_type; // "session" or "system"
    QString m_socket;
    Child m_daemon;
};

} // namespace sandbox
