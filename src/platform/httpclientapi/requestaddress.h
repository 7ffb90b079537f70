// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// The address of a request. Valid is only an https URL with a host, a port of 1 to 65535 if any, and no user
// information: that would be sent to the host as credentials.
class RequestAddress
{
public:
    explicit RequestAddress(const QString &url);

    bool isValid() const { return !m_encoded.isEmpty(); }

    // As it goes to the server; empty when not valid.
    QByteArray encoded() const { return m_encoded; }

    // For log lines: without user information, query and fragment, which may hold names or secrets.
    QString display() const { return m_display; }

private:
    QByteArray m_encoded;
    QString m_display;
};
