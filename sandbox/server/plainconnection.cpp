// SPDX-License-Identifier: Apache-2.0
#include "server/plainconnection.h"

#include "server/wire.h"

#include <boost/asio/write.hpp>

#include <chrono>

namespace sandbox {

namespace asio = boost::asio;

namespace {

constexpr std::chrono::seconds kPatience(30);
constexpr std::size_t kChunk = 4096;

} // namespace

PlainConnection::PlainConnection(asio::ip::tcp::socket socket, FrontDesk &desk, ConnectionFault fault)
    : m_stream(std::move(socket))
    , m_desk(desk)
    , m_fault(fault)
    , m_wire(fault == ConnectionFault::HandshakeGarbage ? QByteArray::fromHex("160303ffff6e6f6e73656e7365")
                                                        : wireOf({refusal({refusals::kNotHttp})}, false))
{
}

void PlainConnection::start()
{
    m_stream.expires_after(kPatience);
    m_stream.async_read_some(m_buffer.prepare(kChunk),
                             [self = shared_from_this()](const boost::beast::error_code &error, std::size_t) {
                                 if (!error)
                                     self->answer();
                             });
}

void PlainConnection::answer()
{
    if (m_fault == ConnectionFault::Mute) {
        awaitEnd();
        return;
    }
    if (m_fault == ConnectionFault::HandshakeClosed)
        return;
    if (m_fault == ConnectionFault::HandshakeReset) {
        reset();
        return;
    }
    if (m_fault == ConnectionFault::Plain)
        m_desk.note(QStringLiteral("answered a client in plain HTTP"));
    asio::async_write(m_stream, asio::buffer(m_wire.constData(), static_cast<std::size_t>(m_wire.size())),
                      [self = shared_from_this()](boost::beast::error_code error, std::size_t) {
                          self->m_stream.socket().shutdown(asio::socket_base::shutdown_send, error);
                          if (!error)
                              self->awaitEnd();
                      });
}

void PlainConnection::reset()
{
    boost::beast::error_code ignored;
    m_stream.socket().set_option(asio::socket_base::linger(true, 0), ignored);
    m_stream.close();
}

// Closing with unread bytes would reset the connection and take the answer away from the client.
void PlainConnection::awaitEnd()
{
    m_buffer.clear();
    m_stream.async_read_some(m_buffer.prepare(kChunk),
                             [self = shared_from_this()](const boost::beast::error_code &error, std::size_t) {
                                 if (!error)
                                     self->awaitEnd();
                             });
}

} // namespace sandbox
