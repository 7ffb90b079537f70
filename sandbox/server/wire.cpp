// SPDX-License-Identifier: Apache-2.0
#include "server/wire.h"

#include <ostream> // Boost uses it without including it

#include <boost/beast/http/status.hpp>

namespace sandbox {

namespace {

constexpr int kEndlessLength = 1000000;          // bytes that a drip announces: longer than anybody waits for
constexpr int kFloodLength = 1024 * 1024 * 1024; // bytes that a flood announces
constexpr int kBodyToCut = 64; // bytes that a truncated reply announces when it has none of its own

QByteArray reasonOf(int status)
{
    const auto text =
        boost::beast::http::obsolete_reason(boost::beast::http::int_to_status(static_cast<unsigned>(status)));
    return {text.data(), static_cast<int>(text.size())};
}

QByteArray headerOf(const Reply &reply, int length, bool keepAlive)
{
    QByteArray header =
        "HTTP/1.1 " + QByteArray::number(reply.status) + ' ' + reasonOf(reply.status) + "\r\n";
    header += reply.isJson ? "Content-Type: application/json; charset=utf-8\r\n"
                           : "Content-Type: text/html; charset=utf-8\r\n";
    header += "Content-Length: " + QByteArray::number(length) + "\r\n";
    if (!reply.allow.isEmpty())
        header += "Allow: " + reply.allow.toLatin1() + "\r\n";
    if (!reply.location.isEmpty())
        header += "Location: " + reply.location.toLatin1() + "\r\n";
    header += keepAlive ? "Cache-Control: no-store\r\n\r\n"
                        : "Cache-Control: no-store\r\nConnection: close\r\n\r\n";
    return header;
}

} // namespace

QByteArray wireOf(const Answer &answer, bool keepAlive)
{
    const QByteArray &body = answer.reply.body;
    const int length = static_cast<int>(body.size());
    switch (answer.fault) {
    case Fault::None:
        return headerOf(answer.reply, length, keepAlive) + body;
    case Fault::HalfHeader: {
        const QByteArray header = headerOf(answer.reply, length, keepAlive);
        return header.left(header.size() / 2);
    }
    case Fault::Truncate:
        return headerOf(answer.reply, length > 0 ? length : kBodyToCut, keepAlive) + body.left(length / 2);
    case Fault::Drip:
        return headerOf(answer.reply, kEndlessLength, keepAlive) + body;
    case Fault::Flood:
        return headerOf(answer.reply, kFloodLength, keepAlive) + body;
    case Fault::Garbage:
        return QByteArray::fromHex("00ff15c3") + "this is no answer\r\n\r\n";
    case Fault::CloseBeforeReply:
    case Fault::Reset:
        break;
    }
    return {};
}

} // namespace sandbox
