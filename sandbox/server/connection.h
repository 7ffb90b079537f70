// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "server/frontdesk.h"

#include <boost/asio/posix/stream_descriptor.hpp>
#include <boost/asio/ssl/context.hpp>
#include <boost/asio/steady_timer.hpp>
#include <boost/beast/core.hpp>
#include <boost/beast/http.hpp>
#include <boost/beast/ssl.hpp>

#include <memory>
#include <optional>

namespace sandbox {

// One TLS connection of a client: handshake, then requests and answers until one side ends it. Made by
// Network, lives as long as an operation of its own is under way. All on the thread of the server.
class Connection : public std::enable_shared_from_this<Connection>
{
public:
    // `fault` is one that strikes after the handshake, or None.
    Connection(boost::asio::ip::tcp::socket socket, boost::asio::ssl::context &tls, Door door,
               FrontDesk &desk, ConnectionFault fault = ConnectionFault::None);

    void start();
    // The connection ends at once, whatever goes on.
    void drop();

private:
    using Error = boost::beast::error_code;

    void onHandshake(const Error &error);
    void readRequest();
    void readPartOfRequest();
    void onRead(const Error &error);
    void onBrokenRequest(const Error &error);
    void answerLater();
    void answerWhenReleased();
    void send();
    void drip(int sent);
    void flood();
    void onSent(const Error &error);
    void reset();
    // Reads what the peer is still sending, so that it does not lose the reply that refused it.
    void drain();
    void end();

    Request requestAsRead() const;
    void takeCertificate();

    boost::beast::ssl_stream<boost::beast::tcp_stream> m_stream;
    boost::asio::steady_timer m_timer;
    boost::asio::posix::stream_descriptor m_hold;
    char m_release = 0;
    Door m_door;
    FrontDesk &m_desk;
    ConnectionFault m_fault;
    QString m_peer;
    QString m_certificateName;
    QString m_certificateSerial;

    boost::beast::flat_buffer m_buffer;
    std::optional<boost::beast::http::request_parser<boost::beast::http::string_body>> m_parser;
    Request m_request;
    Answer m_answer;
    QByteArray m_wire;
    bool m_keepAlive = false;
    bool m_drain = false;
    int m_drained = 0;
};

} // namespace sandbox
