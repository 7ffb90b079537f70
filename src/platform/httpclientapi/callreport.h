// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"
#include "sslconfiguration.h"

#include <QString>

// The warning lines of one call. Each starts with method and address and says how far the request came; none
// holds query, body or key.
class CallReport
{
public:
    CallReport(const char *method, const QString &address);

    void refused(const QString &reason) const;
    // Of a file that the request is made with, though it could be kept better.
    void advised(const QString &advice) const;
    // The peer was accepted unverified.
    void firstContact(const QString &fingerprint) const;
    // One line if the exchange did not end with a complete reply of a status below 300.
    void ended(const ExchangeOutcome &outcome, const SslConfiguration &configuration) const;

private:
    void warn(const QString &text) const;

    QString m_call; // how each line starts
};
