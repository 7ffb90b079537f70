// SPDX-License-Identifier: Apache-2.0
#include "server/network.h"

#include "journal/error.h"

#include <boost/asio/ip/v6_only.hpp>
#include <boost/asio/post.hpp>

#include <chrono>
#include <fcntl.h>
#include <future>

namespace sandbox {

namespace asio = boost::asio;
namespace ssl = boost::asio::ssl;
using asio::ip::tcp;
using ErrorCode = boost::system::error_code;

namespace {

constexpr int kPortChoices = 20; // tries for a free port
constexpr std::chrono::milliseconds kPause(100);

void keepFromChildren(int socket)
{
    ::fcntl(socket, F_SETFD, FD_CLOEXEC);
}

// Some faults are offers that no client of today takes up. Throws boost::system::system_error.
ssl::context tlsFor(const ListenerPlan &plan, const KeyPair &credentials, ConnectionFault fault)
{
    ssl::context tls(ssl::context::tls_server);
    SSL_CTX *context = tls.native_handle();
    const bool isOld = fault == ConnectionFault::OldTls;
    SSL_CTX_set_min_proto_version(context, isOld ? TLS1_VERSION : TLS1_2_VERSION);
    if (isOld)
        SSL_CTX_set_max_proto_version(context, TLS1_1_VERSION);
    if (fault == ConnectionFault::NoCommonCipher) {
        // A cipher for RSA keys beside a key of another kind.
        SSL_CTX_set_max_proto_version(context, TLS1_2_VERSION);
        SSL_CTX_set_cipher_list(context, "AES128-SHA256");
    }
    // No session is resumed: every connection shows and proves its certificates again.
    SSL_CTX_set_session_cache_mode(context, SSL_SESS_CACHE_OFF);
    SSL_CTX_set_options(context, SSL_OP_NO_TICKET);
    SSL_CTX_set_num_tickets(context, 0);
    tls.use_certificate_chain(bufferOf(credentials.certificatePem));
    tls.use_private_key(bufferOf(credentials.keyPem), ssl::context::pem);
    if (!plan.clientCaPem.isEmpty()) {
        tls.add_certificate_authority(bufferOf(plan.clientCaPem));
        tls.set_verify_mode(ssl::verify_peer | ssl::verify_fail_if_no_peer_cert);
    }
    return tls;
}

// Throws boost::system::system_error.
tcp::acceptor bound(asio::io_context &io, const tcp::endpoint &endpoint)
{
    tcp::acceptor acceptor(io, endpoint.protocol());
    keepFromChildren(acceptor.native_handle());
    if (endpoint.protocol() == tcp::v6())
        acceptor.set_option(asio::ip::v6_only(true));
    acceptor.set_option(tcp::acceptor::reuse_address(true));
    acceptor.bind(endpoint);
    return acceptor;
}

} // namespace

Network::Network(Dispatcher &dispatcher)
    : m_dispatcher(dispatcher)
{
}

Network::~Network()
{
    m_io.stop();
    if (m_thread.joinable())
        m_thread.join();
}

quint16 Network::open(const ListenerPlan &plan)
{
    try {
        const bool isInCertificate = !plan.faultyCredentials.keyPem.isEmpty();
        OpenListener listener{
            plan, tlsFor(plan, plan.credentials, ConnectionFault::None),
            tlsFor(plan, isInCertificate ? plan.faultyCredentials : plan.credentials, plan.connections.fault),
            takePort(plan.port, kPortChoices)};
        for (tcp::acceptor &acceptor : listener.acceptors)
            acceptor.listen();
        m_listeners.push_back(std::move(listener));
        return m_listeners.back().acceptors.front().local_endpoint().port();
    } catch (const boost::system::system_error &failure) {
        const QString reason = QString::fromStdString(failure.code().message());
        throw Error(QStringLiteral("port %1: %2").arg(plan.port).arg(reason));
    }
}

// A free port is one that is free for both kinds of loopback.
Network::Acceptors Network::takePort(quint16 port, int choices)
{
    Acceptors acceptors;
    acceptors.push_back(bound(m_io, {asio::ip::address_v4::loopback(), port}));
    const quint16 chosen = acceptors.front().local_endpoint().port();
    try {
        acceptors.push_back(bound(m_io, {asio::ip::address_v6::loopback(), chosen}));
    } catch (const boost::system::system_error &error) {
        if (error.code() == asio::error::address_in_use && port == 0 && choices > 1)
            return takePort(port, choices - 1);
        const bool isNoIpv6 = error.code() == asio::error::address_family_not_supported ||
                              error.code() == boost::system::errc::address_not_available;
        if (!isNoIpv6)
            throw;
    }
    return acceptors;
}

void Network::run()
{
    for (OpenListener &listener : m_listeners) {
        for (tcp::acceptor &acceptor : listener.acceptors)
            accept(listener, acceptor);
    }
    const ConnectionScript script = m_listeners.front().plan.connections;
    if (script.fault == ConnectionFault::Refused && script.from == 1)
        setListening(false);
    m_busy.emplace(m_io.get_executor());
    m_thread = std::thread([this] { m_io.run(); });
}

void Network::accept(OpenListener &listener, tcp::acceptor &acceptor)
{
    acceptor.async_accept([this, &listener, &acceptor](const ErrorCode &error, tcp::socket socket) {
        if (error == asio::error::operation_aborted)
            return;
        if (!error) {
            serve(listener, std::move(socket));
            if (m_isListening)
                accept(listener, acceptor);
            return;
        }
        m_dispatcher.note(QStringLiteral("cannot accept: ") + QString::fromStdString(error.message()));
        m_pause.expires_after(kPause);
        m_pause.async_wait([this, &listener, &acceptor](const ErrorCode &) { accept(listener, acceptor); });
    });
}

void Network::serve(OpenListener &listener, tcp::socket socket)
{
    keepFromChildren(socket.native_handle());
    const ConnectionFault fault = nextFault(listener.plan.connections);
    const auto connection = std::make_shared<Connection>(
        std::move(socket), fault == ConnectionFault::None ? listener.tls : listener.faultyTls,
        listener.plan.kind, m_dispatcher, fault);
    m_connections.remove_if([](const auto &each) { return each.expired(); });
    m_connections.push_back(connection);
    connection->start();
}

ConnectionFault Network::nextFault(const ConnectionScript &script)
{
    ++m_accepted;
    if (script.fault == ConnectionFault::Refused) {
        if (m_accepted + 1 >= script.from)
            setListening(false);
        return ConnectionFault::None;
    }
    return m_accepted >= script.from ? script.fault : ConnectionFault::None;
}

// The ports stay ours.
void Network::setListening(bool listening)
{
    m_isListening = listening;
    for (OpenListener &listener : m_listeners) {
        for (tcp::acceptor &acceptor : listener.acceptors) {
            if (listening) {
                acceptor.listen();
                accept(listener, acceptor);
                continue;
            }
            const tcp::endpoint endpoint = acceptor.local_endpoint();
            acceptor.close();
            acceptor = bound(m_io, endpoint);
        }
    }
}

void Network::repair()
{
    onThread([this] {
        for (OpenListener &listener : m_listeners)
            listener.plan.connections = {};
        m_dispatcher.repair();
        if (!m_isListening)
            setListening(true);
    });
}

void Network::dropConnections()
{
    onThread([this] {
        for (const auto &each : m_connections) {
            if (const auto connection = each.lock())
                connection->drop();
        }
        m_connections.clear();
    });
}

void Network::onThread(const std::function<void()> &work)
{
    std::promise<void> done;
    asio::post(m_io, [&] {
        work();
        done.set_value();
    });
    done.get_future().wait();
}

} // namespace sandbox
