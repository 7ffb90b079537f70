// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "server/frontdesk.h"

#include <boost/beast/core.hpp>

#include <memory>

namespace sandbox {

// A connection that never comes to speak TLS: whatever arrives first, a TLS greeting most often, is answered
// by a plain "400 Bad Request", as a mistyped port may lead to it, or by what the fault says (Mute,
// HandshakeClosed, HandshakeReset, HandshakeGarbage). Made by Network.
class PlainConnection : public std::enable_shared_from_this<PlainConnection>
{
public:
    PlainConnection(boost::asio::ip::tcp::socket socket, FrontDesk &desk,
                    ConnectionFault fault = ConnectionFault::Plain);

    void start();
    // The connection ends at once, whatever goes on.
    void drop() { m_stream.close(); }

private:
    void answer();
    void awaitEnd();
    void reset();

    boost::beast::tcp_stream m_stream;
    FrontDesk &m_desk;
    ConnectionFault m_fault;
    boost::beast::flat_buffer m_buffer;
    QByteArray m_wire;
};

} // namespace sandbox
