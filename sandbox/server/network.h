// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificate.h"
#include "server/exchange.h"

#include <memory>

namespace sandbox {

class FrontDesk;

// How one address of the server is opened.
struct DoorPlan
{
    Door door = Door::Enrolment;
    quint16 port = 0; // 0: any free one
    bool listens =
        true; // false: the port is taken, so that nobody else answers there, but refuses connections
    bool speaksTls = true;
    KeyPair credentials;
    ConnectionScript connections; // faults of the following connections
    KeyPair faultyCredentials;    // where the fault is in the certificate
    QByteArray clientCaPem;       // clients must show a certificate of this CA; empty: they are not asked
};

// The listeners on 127.0.0.1 and, where it exists, ::1, and the one thread that serves their connections.
// Sockets are not handed down to programs that this process starts.
class Network
{
public:
    explicit Network(FrontDesk &desk);
    ~Network(); // ends the thread and all connections

    // Takes the port at once; connections are served from run() on. Returns the port, or 0 with `error` set.
    quint16 open(const DoorPlan &plan, QString *error);
    void run();
    // No connection goes wrong any more, and every address listens.
    void mend();
    // Ends every connection at once.
    void dropConnections();

private:
    class Private;
    std::unique_ptr<Private> m_private;
};

} // namespace sandbox
