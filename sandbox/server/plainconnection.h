// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "server/frontdesk.h"

#include <boost/beast/core.hpp>

#include <memory>

namespace sandbox {

// A connection to a web server that speaks no TLS, as a mistyped port may lead to one: whatever arrives
// first, a TLS greeting most often, is answered by a plain "400 Bad Request". Made by Network.
class PlainConnection : public std::enable_shared_from_this<PlainConnection>
{
public:
    PlainConnection(boost::asio::ip::tcp::socket socket, FrontDesk &desk);

    void start();

private:
    void answer();
    void awaitEnd();

    boost::beast::tcp_stream m_stream;
    FrontDesk &m_desk;
    boost::beast::flat_buffer m_buffer;
    QByteArray m_wire;
};

} // namespace sandbox
