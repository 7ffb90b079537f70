// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// Takes the reply as it comes in and says when it is to be aborted: too long, or in a coding that would
// have to be undone. Knows nothing of libcurl but the convention that a callback takes all bytes or none.
class ReplyReader
{
public:
    bool takeHeaderLine(const QByteArray &line);
    bool takeBody(const char *bytes, size_t size);

    // Status of the header that was read to its end, interim (1xx) ones left out; 0 before that.
    int status() const { return m_status; }
    // Whether a reply that libcurl has read without complaint is all that the server had to say: it has no
    // body, it came in chunks, `length` (what libcurl expects, -1: unknown) is the length that its
    // header tells (and not one of an interim reply), or the server ended the connection in order.
    bool isComplete(qint64 length, bool endedInOrder) const;
    QByteArray body() const { return m_body; }
    QByteArray date() const { return m_date; }            // as told by the final header; empty: not told
    QString abortReason() const { return m_abortReason; } // empty: not aborted

private:
    bool takeField(const QByteArray &line);
    bool abort(const QString &reason);

    int m_lineStatus = 0; // of the header that is being read; 0 before its first line
    int m_status = 0;
    bool m_chunked = false;
    QByteArray m_length; // as told
    size_t m_headerSize = 0;
    QByteArray m_body;
    QByteArray m_date;
    QString m_abortReason;
};
