// SPDX-License-Identifier: Apache-2.0
#include "server/connection.h"

#include <QSslCertificate>

#include <boost/asio/read.hpp>

#include <openssl/x509.h>

#include <chrono>

namespace sandbox {

namespace asio = boost::asio;
namespace beast = boost::beast;
namespace http = boost::beast::http;

namespace {

constexpr std::uint64_t kMaxBody = 1024UL * 1024UL;
constexpr std::uint32_t kMaxHeader = 64 * 1024;
// For a handshake, for the next request, for a reply to be received.
constexpr std::chrono::seconds kTimeLimit(30);
constexpr std::chrono::seconds kCloseLimit(2); // for the peer's part in the end of the connection
constexpr std::chrono::seconds kDrip(1);
constexpr std::size_t kPartOfRequest = 10;
constexpr int kFloodChunk = 64 * 1024;
constexpr std::size_t kMaxDrained = std::size_t(64) * 1024 * 1024;

QString textOf(beast::string_view text)
{
    return QString::fromUtf8(text.data(), static_cast<int>(text.size()));
}

} // namespace

Connection::Connection(asio::ip::tcp::socket socket, asio::ssl::context &tls, Listener listener,
                       Dispatcher &dispatcher, ConnectionFault fault)
    : m_stream(std::move(socket), tls)
    , m_timer(m_stream.get_executor())
    , m_hold(m_stream.get_executor())
    , m_listener(listener)
    , m_dispatcher(dispatcher)
    , m_fault(fault)
{
}

bool Connection::speaksTls() const
{
    // Those from Mute to HandshakeGarbage strike in place of the handshake.
    return m_fault < ConnectionFault::Mute || m_fault > ConnectionFault::HandshakeGarbage;
}

void Connection::drop()
{
    m_timer.cancel();
    m_hold.close();
    plain().close();
}

void Connection::start()
{
    Error error;
    m_peer = QString::fromStdString(plain().socket().remote_endpoint(error).address().to_string());
    plain().expires_after(kTimeLimit);
    if (speaksTls())
        m_stream.async_handshake(asio::ssl::stream_base::server,
                                 beast::bind_front_handler(&Connection::onHandshake, shared_from_this()));
    else
        plain().async_read_some(m_buffer.prepare(kMaxHeader),
                                beast::bind_front_handler(&Connection::onGreeting, shared_from_this()));
}

void Connection::onGreeting(const Error &error, std::size_t /*size*/)
{
    if (error || m_fault == ConnectionFault::HandshakeClosed)
        return;
    if (m_fault == ConnectionFault::Mute) {
        drain();
        return;
    }
    if (m_fault == ConnectionFault::HandshakeReset) {
        reset();
        return;
    }
    if (m_fault == ConnectionFault::Plain)
        m_dispatcher.note(QStringLiteral("answered a client in plain HTTP"));
    m_wire = m_fault == ConnectionFault::Plain ? wireOf({refusal({refusals::kNotHttp})}, false)
                                               : QByteArray::fromHex("160303ffff6e6f6e73656e7365");
    asio::async_write(plain(), bufferOf(m_wire), [self = shared_from_this()](Error failure, std::size_t) {
        self->plain().socket().shutdown(asio::socket_base::shutdown_send, failure);
        if (!failure)
            self->drain();
    });
}

void Connection::onHandshake(const Error &error)
{
    if (error) {
        const QString where =
            m_listener == Listener::Managed ? QStringLiteral("managed") : QStringLiteral("enrolment");
        m_dispatcher.note(QStringLiteral("TLS with %1 at the %2 address failed: %3")
                              .arg(m_peer, where, QString::fromStdString(error.message())));
        return;
    }
    takeCertificate();
    if (m_fault == ConnectionFault::ClosedBeforeRequest)
        end();
    else if (m_fault == ConnectionFault::ResetBeforeRequest)
        reset();
    else if (m_fault == ConnectionFault::ClosedDuringRequest)
        m_stream.async_read_some(
            m_buffer.prepare(kPartOfRequest),
            [self = shared_from_this()](const Error &, std::size_t) { self->plain().close(); });
    else
        readRequest();
}

void Connection::takeCertificate()
{
    const std::unique_ptr<X509, decltype(&X509_free)> certificate(
        SSL_get1_peer_certificate(m_stream.native_handle()), &X509_free);
    if (!certificate)
        return;
    QByteArray der(i2d_X509(certificate.get(), nullptr), '\0');
    auto *bytes = reinterpret_cast<unsigned char *>(der.data());
    i2d_X509(certificate.get(), &bytes);
    const QByteArray pem = QSslCertificate(der, QSsl::Der).toPem();
    m_certificateName = certificateCommonName(pem);
    m_certificateSerial = certificateSerial(pem);
}

void Connection::readRequest()
{
    m_parser.emplace();
    m_parser->body_limit(kMaxBody);
    m_parser->header_limit(kMaxHeader);
    plain().expires_after(kTimeLimit);
    http::async_read(m_stream, m_buffer, *m_parser,
                     beast::bind_front_handler(&Connection::onRead, shared_from_this()));
}

void Connection::onRead(const Error &error, std::size_t /*size*/)
{
    if (error) {
        onBrokenRequest(error);
        return;
    }
    m_request = requestAsRead();
    m_keepAlive = m_parser->get().keep_alive();
    m_answer = m_dispatcher.receive(m_request);
    if (m_answer.isHeld)
        sendWhenReleased();
    else
        send();
}

void Connection::onBrokenRequest(const Error &error)
{
    const bool tooLarge = error == http::error::body_limit;
    const bool unreadable = error.category() == make_error_code(http::error::body_limit).category() &&
                            error != http::error::end_of_stream && error != http::error::partial_message;
    if (!tooLarge && !unreadable) {
        if (error == http::error::partial_message)
            m_dispatcher.note(QStringLiteral("request from %1 was incomplete").arg(m_peer));
        end();
        return;
    }
    m_request = requestAsRead();
    m_request.body.clear();
    m_keepAlive = false;
    m_drain = true;
    m_answer = m_dispatcher.refuse(m_request, tooLarge ? refusals::kTooLarge : refusals::kNotHttp);
    send();
}

Request Connection::requestAsRead() const
{
    const auto &message = m_parser->get();
    return {m_listener,
            textOf(message.method_string()),
            QUrl(textOf(message.target()), QUrl::StrictMode),
            QByteArray(message.body().data(), static_cast<int>(message.body().size())),
            textOf(message[boost::beast::http::field::host]),
            m_peer,
            m_certificateName,
            m_certificateSerial};
}

void Connection::sendWhenReleased()
{
    const auto sendUnlessDropped = [self = shared_from_this()](const Error &error, std::size_t /*size*/) {
        Error ignored;
        self->m_hold.close(ignored);
        if (!error)
            self->send();
    };
    Error ignored;
    m_hold.assign(m_dispatcher.openHold(), ignored);
    m_hold.async_read_some(asio::buffer(&m_release, 1), sendUnlessDropped);
}

void Connection::send()
{
    m_dispatcher.sending(m_request, m_answer);
    m_wire = wireOf(m_answer, m_keepAlive);
    if (m_answer.fault == Fault::Reset)
        reset();
    else if (m_answer.fault == Fault::Drip || m_answer.fault == Fault::Flood)
        sendEndlessly();
    else if (m_wire.isEmpty())
        end();
    else {
        plain().expires_after(kTimeLimit);
        asio::async_write(m_stream, bufferOf(m_wire),
                          beast::bind_front_handler(&Connection::onSent, shared_from_this()));
    }
}

// A drip goes out byte by byte, a flood at once; blanks follow endlessly.
void Connection::sendEndlessly()
{
    const bool drips = m_answer.fault == Fault::Drip;
    m_chunk = drips ? m_wire.left(1) : m_wire;
    m_wire.remove(0, m_chunk.size());
    if (m_wire.isEmpty())
        m_wire = QByteArray(drips ? 1 : kFloodChunk, ' ');
    plain().expires_after(kTimeLimit);
    asio::async_write(m_stream, bufferOf(m_chunk),
                      [self = shared_from_this(), drips](const Error &failure, std::size_t) {
                          if (failure)
                              return;
                          self->m_timer.expires_after(drips ? kDrip : kDrip.zero());
                          self->m_timer.async_wait([self](const Error &error) {
                              if (!error)
                                  self->sendEndlessly();
                          });
                      });
}

void Connection::onSent(const Error &error, std::size_t /*size*/)
{
    if (error)
        m_dispatcher.note(
            QStringLiteral("reply to %1 %2 was not received: %3")
                .arg(m_request.method, m_request.target.path(), QString::fromStdString(error.message())));
    else if (m_drain)
        drain();
    else if (m_keepAlive && m_answer.fault == Fault::None)
        readRequest();
    else
        end();
}

void Connection::reset()
{
    Error ignored;
    plain().socket().set_option(asio::socket_base::linger(true, 0), ignored);
    plain().socket().close(ignored);
}

void Connection::drain()
{
    const auto rest = asio::dynamic_buffer(m_rest, kMaxDrained);
    const auto whenDrained = [self = shared_from_this()](const Error &, std::size_t) {
        if (self->speaksTls())
            self->end();
    };
    if (speaksTls())
        asio::async_read(m_stream, rest, whenDrained);
    else
        asio::async_read(plain(), rest, whenDrained);
}

void Connection::end()
{
    plain().expires_after(kCloseLimit);
    m_stream.async_shutdown([self = shared_from_this()](const Error &) { self->plain().close(); });
}

} // namespace sandbox
