// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificate.h"
#include "server/connection.h"

#include <boost/asio/executor_work_guard.hpp>
#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>

#include <functional>
#include <list>
#include <memory>
#include <optional>
#include <thread>

namespace sandbox {

// How one address of the server is opened.
struct ListenerPlan
{
    Listener kind = Listener::Enrolment;
    quint16 port = 0; // 0: any free one
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
    explicit Network(Dispatcher &dispatcher);
    ~Network(); // ends the thread and all connections
    Q_DISABLE_COPY_MOVE(Network)

    // Takes the port at once, and returns it; connections are served from run() on. Throws an Error.
    quint16 open(const ListenerPlan &plan);
    void run();
    // No connection goes wrong any more, and every address listens.
    void repair();
    // Ends every connection at once.
    void dropConnections();

private:
    using Acceptors = std::list<boost::asio::ip::tcp::acceptor>;
    struct OpenListener
    {
        ListenerPlan plan;
        boost::asio::ssl::context tls;
        boost::asio::ssl::context faultyTls;
        Acceptors acceptors;
    };

    // choices: how often another free one is tried where 0 is asked for.
    Acceptors takePort(quint16 port, int choices);
    void accept(OpenListener &listener, boost::asio::ip::tcp::acceptor &acceptor);
    void serve(OpenListener &listener, boost::asio::ip::tcp::socket socket);
    ConnectionFault nextFault(const ConnectionScript &script);
    void setListening(bool listening);
    // Runs `work` on the thread of the connections and waits for it.
    void onThread(const std::function<void()> &work);

    Dispatcher &m_dispatcher;
    boost::asio::io_context m_io;
    boost::asio::steady_timer m_pause{m_io};
    // Keeps the thread where no address listens.
    std::optional<boost::asio::executor_work_guard<boost::asio::io_context::executor_type>> m_busy;
    std::list<OpenListener> m_listeners;
    std::list<std::weak_ptr<Connection>> m_connections; // all that exist, and some that did
    int m_accepted = 0;
    bool m_isListening = true;
    std::thread m_thread;
};

} // namespace sandbox
