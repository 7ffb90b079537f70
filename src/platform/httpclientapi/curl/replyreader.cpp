// SPDX-License-Identifier: Apache-2.0
#include "replyreader.h"

#include <QList>

#include <algorithm>

namespace {

constexpr size_t kMaxHeaderSize = 256UL * 1024; // interim headers and trailers included
constexpr size_t kMaxBodySize = 4UL * 1024 * 1024;
constexpr int kFirstFinalStatus = 200;

// Status of a line like "HTTP/1.1 200 OK", 0 for any other.
int statusOf(const QByteArray &line)
{
    if (!line.startsWith("HTTP/"))
        return 0;
    return line.simplified().split(' ').value(1).toInt();
}

bool isNumber(const QByteArray &text)
{
    return !text.isEmpty() &&
           std::all_of(text.begin(), text.end(), [](char c) { return c >= '0' && c <= '9'; });
}

} // namespace

bool ReplyReader::takeHeaderLine(const QByteArray &line)
{
    m_headerSize += static_cast<size_t>(line.size());
    if (m_headerSize > kMaxHeaderSize)
        return abort(QStringLiteral("header longer than 256 KiB"));
    if (m_status != 0)
        return true; // a trailer
    if (m_lineStatus == 0) {
        m_lineStatus = statusOf(line);
        return true;
    }
    if (!line.trimmed().isEmpty())
        return takeField(line);
    if (m_lineStatus >= kFirstFinalStatus)
        m_status = m_lineStatus;
    m_lineStatus = 0;
    return true;
}

// Goes by libcurl's measure: a folded line continues the value before it and is no field, whatever it says.
bool ReplyReader::takeField(const QByteArray &line)
{
    const int colon = line.indexOf(':');
    const QByteArray name = line.left(colon).toLower();
    const QByteArray value = line.mid(colon + 1).trimmed();
    const bool isFinal = m_lineStatus >= kFirstFinalStatus;
    if (name == "transfer-encoding") {
        if (value.toLower() != "chunked")
            return abort(QStringLiteral("transfer coding that was not asked for"));
        m_chunked = m_chunked || isFinal;
    }
    if (name == "content-length" && isFinal) {
        if (!isNumber(value) || (!m_length.isEmpty() && value != m_length))
            return abort(QStringLiteral("Content-Length makes no sense"));
        m_length = value;
    }
    if (name == "date" && isFinal)
        m_date = value;
    return true;
}

bool ReplyReader::isComplete(qint64 length, bool endedInOrder) const
{
    const bool withoutBody = m_status == 204 || m_status == 304;
    const bool lengthIsTold = length >= 0 && m_length.toLongLong() == length && !m_length.isEmpty();
    return m_status != 0 && (withoutBody || m_chunked || lengthIsTold || endedInOrder);
}

bool ReplyReader::takeBody(const char *bytes, size_t size)
{
    if (size > kMaxBodySize - static_cast<size_t>(m_body.size()))
        return abort(QStringLiteral("longer than 4 MiB"));
    m_body.append(bytes, static_cast<int>(size));
    return true;
}

bool ReplyReader::abort(const QString &reason)
{
    m_abortReason = reason;
    return false;
}
