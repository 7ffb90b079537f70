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

    void warn(const QString &text) const;
    void refused(const QString &reason) const;
    // One line when the peer was accepted unverified, and one when the exchange did not end with a complete
    // reply of a status below 300.
    void ended(const ExchangeOutcome &outcome, const SslConfiguration &configuration) const;

private:
    QString m_call; // how each line starts
};
