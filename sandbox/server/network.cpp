// SPDX-License-Identifier: Apache-2.0
#include "server/network.h"

#include "server/connection.h"
#include "server/plainconnection.h"

#include <boost/asio/executor_work_guard.hpp>
#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/ip/v6_only.hpp>
#include <boost/asio/post.hpp>

#include <chrono>
#include <fcntl.h>
#include <functional>
#include <future>
#include <list>
#include <optional>
#include <thread>

namespace sandbox {

namespace asio = boost::asio;
namespace ssl = boost::asio::ssl;
using asio::ip::tcp;
using Error = boost::system::error_code;

namespace {

constexpr int kPortChoices = 20; // tries for a free port that is free for both kinds of loopback
constexpr std::chrono::milliseconds kPause(100);

void keepFromChildren(int socket)
{
    ::fcntl(socket, F_SETFD, FD_CLOEXEC);
}

asio::const_buffer bufferOf(const QByteArray &bytes)
{
    return asio::buffer(bytes.constData(), static_cast<std::size_t>(bytes.size()));
}

// No session is resumed: every connection shows and proves its certificates anew.
void forgetSessions(ssl::context &tls)
{
    SSL_CTX_set_session_cache_mode(tls.native_handle(), SSL_SESS_CACHE_OFF);
    SSL_CTX_set_options(tls.native_handle(), SSL_OP_NO_TICKET);
    SSL_CTX_set_num_tickets(tls.native_handle(), 0);
}

// Offers that no client of today takes up.
void spoilProtocol(ssl::context &tls, ConnectionFault fault)
{
    if (fault == ConnectionFault::OldTls) {
        SSL_CTX_set_min_proto_version(tls.native_handle(), TLS1_VERSION);
        SSL_CTX_set_max_proto_version(tls.native_handle(), TLS1_1_VERSION);
    } else if (fault == ConnectionFault::NoCommonCipher) {
        // A cipher for RSA keys beside a key of another kind.
        SSL_CTX_set_max_proto_version(tls.native_handle(), TLS1_2_VERSION);
        SSL_CTX_set_cipher_list(tls.native_handle(), "AES128-SHA256");
    }
}

// Throws boost::system::system_error.
std::unique_ptr<ssl::context> tlsFor(const DoorPlan &plan, const KeyPair &credentials,
                                     ConnectionFault fault = ConnectionFault::None)
{
    auto tls = std::make_unique<ssl::context>(ssl::context::tls_server);
    SSL_CTX_set_min_proto_version(tls->native_handle(), TLS1_2_VERSION);
    spoilProtocol(*tls, fault);
    forgetSessions(*tls);
    tls->use_certificate_chain(bufferOf(credentials.certificatePem));
    tls->use_private_key(bufferOf(credentials.keyPem), ssl::context::pem);
    if (!plan.clientCaPem.isEmpty()) {
        tls->add_certificate_authority(bufferOf(plan.clientCaPem));
        tls->set_verify_mode(ssl::verify_peer | ssl::verify_fail_if_no_peer_cert);
    }
    return tls;
}

// Throws boost::system::system_error.
tcp::acceptor bound(asio::io_context &io, const tcp::endpoint &endpoint, bool listens)
{
    tcp::acceptor acceptor(io, endpoint.protocol());
    keepFromChildren(acceptor.native_handle());
    if (endpoint.protocol() == tcp::v6())
        acceptor.set_option(asio::ip::v6_only(true));
    acceptor.set_option(tcp::acceptor::reuse_address(listens));
    acceptor.bind(endpoint);
    return acceptor;
}

bool isNoIpv6(const Error &error)
{
    return error == asio::error::address_family_not_supported ||
           error == boost::system::errc::address_not_available;
}

} // namespace

class Network::Private
{
public:
    struct Opening
    {
        DoorPlan plan;
        std::unique_ptr<ssl::context> tls;
        std::unique_ptr<ssl::context> faultyTls; // null: the fault is not in there
        std::list<tcp::acceptor> acceptors;
    };

    explicit Private(FrontDesk &frontDesk)
        : desk(frontDesk)
    {
    }

    std::list<tcp::acceptor> takePort(const DoorPlan &plan);
    std::list<tcp::acceptor> takeBoth(quint16 port, bool listens);
    void accept(Opening &opening, tcp::acceptor &acceptor);
    void welcome(Opening &opening, tcp::socket socket);
    ConnectionFault nextFault(const Opening &opening);
    void closeDoors();
    void openDoors();
    template <typename C>
    void start(const std::shared_ptr<C> &connection);
    template <typename Work>
    void onThread(Work work);

    FrontDesk &desk;
    asio::io_context io;
    asio::steady_timer pause{io};
    std::optional<asio::executor_work_guard<asio::io_context::executor_type>> busy; // runs without doors, too
    std::list<Opening> openings;
    struct Drop
    {
        std::weak_ptr<void> connection;
        std::function<void()> end;
    };
    std::list<Drop> drops; // one for each connection that still exists, and some that do not
    int accepted = 0;
    bool areDoorsClosed = false;
    std::thread thread;
};

std::list<tcp::acceptor> Network::Private::takePort(const DoorPlan &plan)
{
    for (int choice = 1;; ++choice) {
        try {
            return takeBoth(plan.port, plan.listens);
        } catch (const boost::system::system_error &error) {
            if (plan.port != 0 || choice == kPortChoices || error.code() != asio::error::address_in_use)
                throw;
        }
    }
}

std::list<tcp::acceptor> Network::Private::takeBoth(quint16 port, bool listens)
{
    std::list<tcp::acceptor> acceptors;
    acceptors.push_back(bound(io, {asio::ip::address_v4::loopback(), port}, listens));
    const quint16 chosen = acceptors.front().local_endpoint().port();
    try {
        acceptors.push_back(bound(io, {asio::ip::address_v6::loopback(), chosen}, listens));
    } catch (const boost::system::system_error &error) {
        if (!isNoIpv6(error.code()))
            throw;
    }
    return acceptors;
}

void Network::Private::accept(Opening &opening, tcp::acceptor &acceptor)
{
    acceptor.async_accept([this, &opening, &acceptor](const Error &error, tcp::socket socket) {
        if (error == asio::error::operation_aborted)
            return;
        if (!error) {
            welcome(opening, std::move(socket));
            if (!areDoorsClosed)
                accept(opening, acceptor);
            return;
        }
        desk.note(QStringLiteral("cannot accept: ") + QString::fromStdString(error.message()));
        pause.expires_after(kPause);
        pause.async_wait([this, &opening, &acceptor](const Error &) { accept(opening, acceptor); });
    });
}

void Network::Private::welcome(Opening &opening, tcp::socket socket)
{
    keepFromChildren(socket.native_handle());
    const ConnectionFault fault = nextFault(opening);
    ssl::context *tls =
        fault == ConnectionFault::None || !opening.faultyTls ? opening.tls.get() : opening.faultyTls.get();
    if (!opening.plan.speaksTls)
        start(std::make_shared<PlainConnection>(std::move(socket), desk));
    else if (fault >= ConnectionFault::Mute && fault <= ConnectionFault::HandshakeGarbage)
        start(std::make_shared<PlainConnection>(std::move(socket), desk, fault));
    else
        start(std::make_shared<Connection>(std::move(socket), *tls, opening.plan.door, desk, fault));
}

template <typename C>
void Network::Private::start(const std::shared_ptr<C> &connection)
{
    drops.remove_if([](const Drop &each) { return each.connection.expired(); });
    drops.push_back({connection, [raw = connection.get()] {
                         raw->drop();
                     }});
    connection->start();
}

ConnectionFault Network::Private::nextFault(const Opening &opening)
{
    const ConnectionScript script = opening.plan.connections;
    ++accepted;
    if (script.fault == ConnectionFault::Refused && accepted + 1 >= script.from) {
        closeDoors();
        return ConnectionFault::None;
    }
    return accepted >= script.from ? script.fault : ConnectionFault::None;
}

// The ports stay ours.
void Network::Private::closeDoors()
{
    areDoorsClosed = true;
    for (Opening &opening : openings) {
        for (tcp::acceptor &acceptor : opening.acceptors) {
            const tcp::endpoint endpoint = acceptor.local_endpoint();
            acceptor.close();
            acceptor = bound(io, endpoint, true);
        }
    }
}

void Network::Private::openDoors()
{
    areDoorsClosed = false;
    for (Opening &opening : openings) {
        for (tcp::acceptor &acceptor : opening.acceptors) {
            acceptor.listen();
            accept(opening, acceptor);
        }
    }
}

// Runs `work` on the thread of the connections and waits for it.
template <typename Work>
void Network::Private::onThread(Work work)
{
    std::promise<void> done;
    asio::post(io, [&] {
        work();
        done.set_value();
    });
    done.get_future().wait();
}

Network::Network(FrontDesk &desk)
    : m_private(std::make_unique<Private>(desk))
{
}

Network::~Network()
{
    m_private->io.stop();
    if (m_private->thread.joinable())
        m_private->thread.join();
}

quint16 Network::open(const DoorPlan &plan, QString *error)
{
    try {
        auto tls = tlsFor(plan, plan.credentials);
        const bool isSpoiled = plan.connections.fault >= ConnectionFault::OldTls;
        auto faultyTls = isSpoiled ? tlsFor(plan,
                                            plan.faultyCredentials.keyPem.isEmpty() ? plan.credentials
                                                                                    : plan.faultyCredentials,
                                            plan.connections.fault)
                                   : nullptr;
        auto acceptors = m_private->takePort(plan);
        if (plan.listens) {
            for (tcp::acceptor &acceptor : acceptors)
                acceptor.listen();
        }
        const quint16 port = acceptors.front().local_endpoint().port();
        m_private->openings.push_back({plan, std::move(tls), std::move(faultyTls), std::move(acceptors)});
        return port;
    } catch (const boost::system::system_error &trouble) {
        *error = QStringLiteral("port %1: %2")
                     .arg(plan.port)
                     .arg(QString::fromStdString(trouble.code().message()));
        return 0;
    }
}

void Network::run()
{
    for (Private::Opening &opening : m_private->openings) {
        for (tcp::acceptor &acceptor : opening.acceptors) {
            if (opening.plan.listens)
                m_private->accept(opening, acceptor);
        }
    }
    if (!m_private->openings.empty()) {
        const ConnectionScript script = m_private->openings.front().plan.connections;
        if (script.fault == ConnectionFault::Refused && script.from == 1)
            m_private->closeDoors();
    }
    m_private->busy.emplace(m_private->io.get_executor());
    m_private->thread = std::thread([this] { m_private->io.run(); });
}

void Network::mend()
{
    m_private->onThread([this] {
        for (Private::Opening &opening : m_private->openings)
            opening.plan.connections = {};
        m_private->desk.mend();
        if (m_private->areDoorsClosed)
            m_private->openDoors();
    });
}

void Network::dropConnections()
{
    m_private->onThread([this] {
        for (const Private::Drop &drop : m_private->drops) {
            if (const auto alive = drop.connection.lock())
                drop.end();
        }
        m_private->drops.clear();
    });
}

} // namespace sandbox
