// SPDX-License-Identifier: Apache-2.0
#include "tlspeer.h"

#include <boost/asio.hpp>
#include <boost/asio/ssl.hpp>
#include <boost/thread/synchronized_value.hpp>

#include <array>
#include <atomic>
#include <thread>

namespace asio = boost::asio;
namespace ssl = boost::asio::ssl;
using asio::ip::tcp;
using Style = TlsPeer::Style;

namespace {

constexpr int kTicketsAtOnce = 100; // made faster than they are read

asio::const_buffer bufferOf(const QByteArray &bytes)
{
    return asio::buffer(bytes.constData(), static_cast<std::size_t>(bytes.size()));
}

// Speaks what a client likes best: HTTP/2 with whoever offers it, and that is no request that this peer can
// read.
int chooseProtocol(SSL * /*ssl*/, const unsigned char **chosen, unsigned char *size,
                   const unsigned char *offered, unsigned int /*offeredSize*/, void * /*data*/)
{
    *size = offered[0];
    *chosen = offered + 1;
    return SSL_TLSEXT_ERR_OK;
}

ssl::context contextFor(const sandbox::KeyPair &identity, Style style, const QByteArray &clientCa)
{
    ssl::context made(ssl::context::tls_server);
    made.use_certificate(bufferOf(identity.certificatePem), ssl::context::pem);
    made.use_private_key(bufferOf(identity.keyPem), ssl::context::pem);
    SSL_CTX_set_options(made.native_handle(), SSL_OP_NO_TICKET); // short ones then, with nothing in them
    SSL_CTX_set_alpn_select_cb(made.native_handle(), chooseProtocol, nullptr);
    if (!clientCa.isEmpty()) {
        made.add_certificate_authority(bufferOf(clientCa));
        const bool required = style == Style::ClientsOnly;
        made.set_verify_mode(ssl::verify_peer | (required ? ssl::verify_fail_if_no_peer_cert : 0));
    }
    if (style == Style::OldTls) {
        SSL_CTX_set_cipher_list(made.native_handle(), "ALL:@SECLEVEL=0");
        SSL_CTX_set_min_proto_version(made.native_handle(), TLS1_VERSION);
        SSL_CTX_set_max_proto_version(made.native_handle(), TLS1_1_VERSION);
    }
    return made;
}

// Until the other side gives up. What a function of OpenSSL has prepared goes out with the handshake.
void flood(ssl::stream<tcp::socket &> &stream, PeerAnswer::Flood kind)
{
    SSL *ssl = stream.native_handle();
    for (;;) {
        for (int i = 0; i < kTicketsAtOnce && kind == PeerAnswer::Flood::Tickets; ++i)
            SSL_new_session_ticket(ssl);
        if (kind == PeerAnswer::Flood::KeyUpdates)
            SSL_key_update(ssl, SSL_KEY_UPDATE_NOT_REQUESTED);
        stream.handshake(ssl::stream_base::server);
    }
}

void flood(tcp::socket & /*stream*/, PeerAnswer::Flood /*kind*/) {}

QString clientNameOf(SSL *ssl)
{
    std::array<char, 64> name = {};
    if (const X509 *certificate = SSL_get0_peer_certificate(ssl))
        X509_NAME_get_text_by_NID(X509_get_subject_name(certificate), NID_commonName, name.data(),
                                  name.size());
    return QString::fromUtf8(name.data());
}

bool isWholeRequest(const QByteArray &bytes)
{
    const QByteArray length = "\r\ncontent-length:";
    const int end = bytes.indexOf("\r\n\r\n");
    const QByteArray header = bytes.left(end).toLower();
    const int field = header.indexOf(length);
    const int bodySize = field < 0 ? 0 : header.mid(field + length.size()).split('\r').first().toInt();
    return end >= 0 && bytes.size() >= end + 4 + bodySize;
}

} // namespace

struct TlsPeer::Engine
{
    Script script;
    Style style;
    ssl::context tls;
    boost::synchronized_value<Record> record = {};
    std::atomic<bool> stops = false;
    asio::io_context io = {};
    tcp::acceptor acceptor{io, {asio::ip::address_v4::loopback(), 0}};
    std::thread thread = {};

    void run()
    {
        for (;;) {
            tcp::socket socket = acceptor.accept();
            if (stops)
                return;
            ++record->connections;
            try {
                serve(socket);
            } catch (const boost::system::system_error &) {
                // The client has ended the connection.
            }
        }
    }

    void serve(tcp::socket &socket)
    {
        if (style == Style::PlainText) {
            answerRequests(socket);
            return;
        }
        ssl::stream<tcp::socket &> stream(socket, tls);
        stream.handshake(ssl::stream_base::server);
        record->clientName = clientNameOf(stream.native_handle());
        const auto end =
            style == Style::ResetAfterHandshake ? PeerAnswer::End::Reset : answerRequests(stream);
        if (end == PeerAnswer::End::Reset)
            socket.set_option(asio::socket_base::linger(true, 0));
        else if (end == PeerAnswer::End::CloseNotify)
            stream.shutdown();
    }

    template <typename Stream>
    PeerAnswer::End answerRequests(Stream &stream)
    {
        for (;;) {
            const QByteArray request = readRequest(stream);
            record->requests.append(request);
            const PeerAnswer answer = script(request);
            asio::write(stream, bufferOf(answer.bytes));
            while (!answer.repeat.isEmpty()) {
                asio::write(stream, bufferOf(answer.repeat));
                std::this_thread::sleep_for(std::chrono::milliseconds(answer.pauseMs));
            }
            if (answer.flood != PeerAnswer::Flood::None)
                flood(stream, answer.flood);
            if (answer.end != PeerAnswer::End::KeepOpen)
                return answer.end;
        }
    }

    template <typename Stream>
    QByteArray readRequest(Stream &stream) const
    {
        std::array<char, 4096> chunk = {};
        QByteArray request;
        do {
            const std::size_t size = stream.read_some(asio::buffer(chunk));
            request.append(chunk.data(), static_cast<int>(size));
        } while (style != Style::PlainText && !isWholeRequest(request));
        return request;
    }
};

TlsPeer::TlsPeer(const sandbox::KeyPair &identity, Script script, Style style, const QByteArray &clientCa)
    : m_engine(new Engine{std::move(script), style, contextFor(identity, style, clientCa)})
{
    m_engine->thread = std::thread([this] { m_engine->run(); });
}

TlsPeer::~TlsPeer()
{
    m_engine->stops = true;
    boost::system::error_code ignored;
    tcp::socket(m_engine->io).connect(m_engine->acceptor.local_endpoint(ignored), ignored); // wakes it
    m_engine->thread.join();
}

quint16 TlsPeer::port() const
{
    return m_engine->acceptor.local_endpoint().port();
}

QString TlsPeer::url(const QString &path) const
{
    return QStringLiteral("https://localhost:%1%2").arg(port()).arg(path);
}

TlsPeer::Record TlsPeer::record() const
{
    return m_engine->record.get();
}

QByteArray httpReply(int status, const QByteArray &body, const QByteArray &headerLines)
{
    return "HTTP/1.1 " + QByteArray::number(status) + " Text\r\n" + headerLines +
           "Content-Length: " + QByteArray::number(body.size()) + "\r\n\r\n" + body;
}
