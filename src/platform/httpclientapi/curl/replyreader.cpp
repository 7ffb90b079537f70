// SPDX-License-Identifier: Apache-2.0
#include "replyreader.h"

#include <QList>

namespace {

constexpr size_t kLongestHeader = 256UL * 1024; // interim headers and trailers included
constexpr size_t kLongestBody = 4UL * 1024 * 1024;
constexpr int kFirstFinalStatus = 200;

// Status of a line like "HTTP/1.1 200 OK", 0 for any other.
int statusOf(const QByteArray &line)
{
    if (!line.startsWith("HTTP/"))
        return 0;
    return line.simplified().split(' ').value(1).toInt();
}

bool isWithoutBody(int status)
{
    return status == 204 || status == 304;
}

} // namespace

bool ReplyReader::takeHeaderLine(const QByteArray &line)
{
    m_headerSize += static_cast<size_t>(line.size());
    if (m_headerSize > kLongestHeader)
        return breakOff(QStringLiteral("header longer than 256 KiB"));
    if (m_status != 0)
        return true; // a trailer

    const QByteArray text = line.trimmed();
    if (const int status = statusOf(text)) {
        m_lineStatus = status;
        m_tellsItsLength = isWithoutBody(status);
    } else if (text.isEmpty() && m_lineStatus >= kFirstFinalStatus) {
        m_status = m_lineStatus;
    }
    return takeField(text.toLower());
}

bool ReplyReader::takeField(const QByteArray &line)
{
    const QByteArray name = line.left(line.indexOf(':'));
    if (name == "transfer-encoding" && line.mid(name.size() + 1).trimmed() != "chunked")
        return breakOff(QStringLiteral("coded transfer that was not asked for"));
    if (name == "transfer-encoding" || name == "content-length")
        m_tellsItsLength = true;
    return true;
}

bool ReplyReader::takeBody(const char *bytes, size_t size)
{
    if (size > kLongestBody - static_cast<size_t>(m_body.size()))
        return breakOff(QStringLiteral("longer than 4 MiB"));
    m_body.append(bytes, static_cast<int>(size));
    return true;
}

bool ReplyReader::breakOff(const QString &reason)
{
    m_breakReason = reason;
    return false;
}
