// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// Takes the reply as it comes in and says when it is to be broken off: too long, or in a coding that would
// have to be undone. Knows nothing of libcurl but the convention that a callback takes all bytes or none.
class ReplyReader
{
public:
    bool takeHeaderLine(const QByteArray &line);
    bool takeBody(const char *bytes, size_t size);

    // Status of the header that was read to its end, interim (1xx) ones left out; 0 before that.
    int status() const { return m_status; }
    // False when only the end of the connection ends the body.
    bool tellsItsLength() const { return m_tellsItsLength; }
    QByteArray body() const { return m_body; }
    QString breakReason() const { return m_breakReason; } // empty: not broken off

private:
    bool takeField(const QByteArray &line);
    bool breakOff(const QString &reason);

    int m_lineStatus = 0; // of the header that is being read
    int m_status = 0;
    bool m_tellsItsLength = false;
    size_t m_headerSize = 0;
    QByteArray m_body;
    QString m_breakReason;
};
