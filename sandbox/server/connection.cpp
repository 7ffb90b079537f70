// SPDX-License-Identifier: Apache-2.0
#include "server/connection.h"

#include "certificate.h"
#include "server/wire.h"

#include <openssl/pem.h>

#include <chrono>

namespace sandbox {

namespace asio = boost::asio;
namespace beast = boost::beast;
namespace http = boost::beast::http;

namespace {

constexpr std::uint64_t kLongestBody = 1024UL * 1024UL;
constexpr std::uint32_t kLongestHeader = 64 * 1024;
constexpr std::chrono::seconds
    kPatience(30);                           // for a handshake, for the next request, for a reply to be taken
constexpr std::chrono::seconds kFarewell(2); // for the peer's part in the end of the connection
constexpr std::chrono::seconds kDrip(1);
constexpr std::size_t kPartOfRequest = 10;
constexpr std::size_t kFloodChunk = std::size_t(64) * 1024;
constexpr int kMostDrained = 64 * 1024 * 1024;

QString textOf(beast::string_view text)
{
    return QString::fromUtf8(text.data(), static_cast<int>(text.size()));
}

QByteArray pemOf(X509 *certificate)
{
    const std::unique_ptr<BIO, decltype(&BIO_free_all)> memory(BIO_new(BIO_s_mem()), &BIO_free_all);
    if (!memory || PEM_write_bio_X509(memory.get(), certificate) != 1)
        return {};
    char *data = nullptr;
    const auto length = BIO_get_mem_data(memory.get(), &data);
    return {data, static_cast<int>(length)};
}

} // namespace

Connection::Connection(asio::ip::tcp::socket socket, asio::ssl::context &tls, Door door, FrontDesk &desk,
                       ConnectionFault fault)
    : m_stream(std::move(socket), tls)
    , m_timer(m_stream.get_executor())
    , m_hold(m_stream.get_executor())
    , m_door(door)
    , m_desk(desk)
    , m_fault(fault)
{
}

void Connection::drop()
{
    m_timer.cancel();
    m_hold.close();
    beast::get_lowest_layer(m_stream).close();
}

void Connection::start()
{
    Error error;
    const auto endpoint = beast::get_lowest_layer(m_stream).socket().remote_endpoint(error);
    m_peer = QString::fromStdString(endpoint.address().to_string());
    beast::get_lowest_layer(m_stream).expires_after(kPatience);
    m_stream.async_handshake(
        asio::ssl::stream_base::server,
        [self = shared_from_this()](const Error &failure) { self->onHandshake(failure); });
}

void Connection::onHandshake(const Error &error)
{
    if (error) {
        const QString where =
            m_door == Door::Managed ? QStringLiteral("managed") : QStringLiteral("enrolment");
        m_desk.note(QStringLiteral("TLS with %1 at the %2 address failed: %3")
                        .arg(m_peer, where, QString::fromStdString(error.message())));
        return;
    }
    takeCertificate();
    if (m_fault == ConnectionFault::ClosedBeforeRequest)
        end();
    else if (m_fault == ConnectionFault::ResetBeforeRequest)
        reset();
    else if (m_fault == ConnectionFault::ClosedDuringRequest)
        readPartOfRequest();
    else
        readRequest();
}

void Connection::readPartOfRequest()
{
    m_stream.async_read_some(m_buffer.prepare(kPartOfRequest),
                             [self = shared_from_this()](const Error & /*error*/, std::size_t) {
                                 beast::get_lowest_layer(self->m_stream).close();
                             });
}

void Connection::takeCertificate()
{
    const std::unique_ptr<X509, decltype(&X509_free)> certificate(
        SSL_get1_peer_certificate(m_stream.native_handle()), &X509_free);
    if (!certificate)
        return;
    const QByteArray pem = pemOf(certificate.get());
    m_certificateName = certificateCommonName(pem);
    m_certificateSerial = certificateSerial(pem);
}

void Connection::readRequest()
{
    m_parser.emplace();
    m_parser->body_limit(kLongestBody);
    m_parser->header_limit(kLongestHeader);
    beast::get_lowest_layer(m_stream).expires_after(kPatience);
    http::async_read(m_stream, m_buffer, *m_parser,
                     [self = shared_from_this()](const Error &error, std::size_t) { self->onRead(error); });
}

void Connection::onRead(const Error &error)
{
    if (error) {
        onBrokenRequest(error);
        return;
    }
    m_request = requestAsRead();
    m_keepAlive = m_parser->get().keep_alive();
    m_answer = m_desk.receive(m_request);
    answerLater();
}

void Connection::onBrokenRequest(const Error &error)
{
    const bool tooLarge = error == http::error::body_limit;
    const bool unreadable = error.category() == make_error_code(http::error::body_limit).category() &&
                            error != http::error::end_of_stream && error != http::error::partial_message;
    if (!tooLarge && !unreadable) {
        if (error == http::error::partial_message)
            m_desk.note(QStringLiteral("request from %1 broke off").arg(m_peer));
        end();
        return;
    }
    m_request = requestAsRead();
    m_request.body.clear();
    m_keepAlive = false;
    m_drain = true;
    m_answer = m_desk.refuse(m_request, tooLarge ? refusals::kTooLarge : refusals::kNotHttp);
    send();
}

Request Connection::requestAsRead() const
{
    const auto &message = m_parser->get();
    Request request;
    request.door = m_door;
    request.method = textOf(message.method_string());
    request.target = QUrl(textOf(message.target()), QUrl::StrictMode);
    request.body = QByteArray(message.body().data(), static_cast<int>(message.body().size()));
    request.peerAddress = m_peer;
    request.certificateName = m_certificateName;
    request.certificateSerial = m_certificateSerial;
    return request;
}

void Connection::answerLater()
{
    if (m_answer.isHeld) {
        answerWhenReleased();
        return;
    }
    m_timer.expires_after(std::chrono::milliseconds(m_answer.delayMs));
    m_timer.async_wait([self = shared_from_this()](const Error &error) {
        if (!error)
            self->send();
    });
}

void Connection::answerWhenReleased()
{
    Error ignored;
    m_hold.assign(m_desk.openHold(), ignored);
    m_hold.async_read_some(asio::buffer(&m_release, 1),
                           [self = shared_from_this()](const Error &error, std::size_t) {
                               self->m_hold.close();
                               if (!error)
                                   self->send();
                           });
}

void Connection::send()
{
    m_desk.sending(m_request, m_answer);
    m_wire = wireOf(m_answer, m_keepAlive);
    if (m_answer.fault == Fault::Reset) {
        reset();
    } else if (m_answer.fault == Fault::Drip) {
        drip(0);
    } else if (m_answer.fault == Fault::Flood) {
        flood();
    } else if (m_wire.isEmpty()) {
        end();
    } else {
        beast::get_lowest_layer(m_stream).expires_after(kPatience);
        asio::async_write(
            m_stream, asio::buffer(m_wire.constData(), static_cast<std::size_t>(m_wire.size())),
            [self = shared_from_this()](const Error &error, std::size_t) { self->onSent(error); });
    }
}

void Connection::drip(int sent)
{
    static const char blank = ' ';
    const char *next = sent < m_wire.size() ? m_wire.constData() + sent : &blank;
    beast::get_lowest_layer(m_stream).expires_after(kPatience);
    asio::async_write(m_stream, asio::buffer(next, 1),
                      [self = shared_from_this(), sent](const Error &failure, std::size_t) {
                          if (failure)
                              return;
                          self->m_timer.expires_after(kDrip);
                          self->m_timer.async_wait([self, sent](const Error &error) {
                              if (!error)
                                  self->drip(sent + 1);
                          });
                      });
}

// The header and what belongs to it, then blanks.
void Connection::flood()
{
    beast::get_lowest_layer(m_stream).expires_after(kPatience);
    asio::async_write(m_stream, asio::buffer(m_wire.constData(), static_cast<std::size_t>(m_wire.size())),
                      [self = shared_from_this()](const Error &error, std::size_t) {
                          self->m_wire = QByteArray(kFloodChunk, ' ');
                          if (!error)
                              self->flood();
                      });
}

void Connection::onSent(const Error &error)
{
    if (error)
        m_desk.note(
            QStringLiteral("reply to %1 %2 was not taken: %3")
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
    auto &socket = beast::get_lowest_layer(m_stream).socket();
    Error ignored;
    socket.set_option(asio::socket_base::linger(true, 0), ignored);
    socket.close(ignored);
}

void Connection::drain()
{
    m_buffer.clear();
    m_stream.async_read_some(m_buffer.prepare(kLongestHeader),
                             [self = shared_from_this()](const Error &error, std::size_t size) {
                                 self->m_drained += static_cast<int>(size);
                                 if (error || self->m_drained > kMostDrained)
                                     self->end();
                                 else
                                     self->drain();
                             });
}

void Connection::end()
{
    beast::get_lowest_layer(m_stream).expires_after(kFarewell);
    m_stream.async_shutdown([self = shared_from_this()](const Error & /*error*/) {
        beast::get_lowest_layer(self->m_stream).close();
    });
}

} // namespace sandbox
