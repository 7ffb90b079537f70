// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "server/dispatcher.h"

#include <boost/asio/posix/stream_descriptor.hpp>
#include <boost/asio/ssl/context.hpp>
#include <boost/asio/steady_timer.hpp>
#include <boost/beast/core.hpp>
#include <boost/beast/http.hpp>
#include <boost/beast/ssl.hpp>

#include <memory>
#include <optional>
#include <string>

namespace sandbox {

inline boost::asio::const_buffer bufferOf(const QByteArray &bytes)
{
    return {bytes.constData(), static_cast<std::size_t>(bytes.size())};
}

// One connection of a client: handshake, then requests and answers until one side ends it. With one of the
// faults from Mute to HandshakeGarbage there is no TLS: whatever arrives first, a TLS greeting
// most often, is answered by what the fault says. Made by Network, lives as long as an operation of its own
// is in progress. All on the thread of the server.
class Connection : public std::enable_shared_from_this<Connection>
{
public:
    // `fault` is one that strikes before the request has been read and is not in `tls`, or None.
    Connection(boost::asio::ip::tcp::socket socket, boost::asio::ssl::context &tls, Listener listener,
               Dispatcher &dispatcher, ConnectionFault fault);

    void start();
    // The connection ends at once, whatever goes on.
    void drop();

private:
    using Error = boost::beast::error_code;

    bool speaksTls() const;
    boost::beast::tcp_stream &plain() { return boost::beast::get_lowest_layer(m_stream); }

    void onGreeting(const Error &error, std::size_t size);
    void onHandshake(const Error &error);
    void readRequest();
    void onRead(const Error &error, std::size_t size);
    void onBrokenRequest(const Error &error);
    void sendWhenReleased();
    void send();
    void sendEndlessly();
    void onSent(const Error &error, std::size_t size);
    void reset();
    // Reads what the peer is still sending: closing with unread bytes would reset the connection and take the
    // reply away from the client.
    void drain();
    void end();

    Request requestAsRead() const;
    void takeCertificate();

    boost::beast::ssl_stream<boost::beast::tcp_stream> m_stream;
    boost::asio::steady_timer m_timer;
    boost::asio::posix::stream_descriptor m_hold;
    char m_release = 0;
    Listener m_listener;
    Dispatcher &m_dispatcher;
    ConnectionFault m_fault;
    QString m_peer;
    QString m_certificateName;
    QString m_certificateSerial;

    boost::beast::flat_buffer m_buffer;
    std::optional<boost::beast::http::request_parser<boost::beast::http::string_body>> m_parser;
    Request m_request;
    Answer m_answer;
    QByteArray m_wire;
    QByteArray m_chunk; // of an answer without end
    bool m_keepAlive = false;
    bool m_drain = false;
    std::string m_rest; // what the peer sent in vain
};

} // namespace sandbox
