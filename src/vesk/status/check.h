// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "finding.h"

// Where a terminal is to join.
struct ServerAddress
{
    QString host; // an IPv6 address in brackets
    int port = 0;

    // From "HOST:PORT"; no value for anything else.
    static std::optional<ServerAddress> parse(const QString &text);
};

// What the server at `address` would say to this terminal if somebody started to join now. Makes the two
// requests that the enrolment program makes before it asks for an account, under the same rules; neither
// changes anything, here or there.
class ServerCheck
{
public:
    explicit ServerCheck(ServerAddress address)
        : m_address(std::move(address))
    {
    }

    int run(); // the exit code
    const Findings &findings() const { return m_findings; }

private:
    struct Call;

    bool reach(const Call &call);
    void compareClocks(const Call &call);
    std::optional<QByteArray> readCa(const Call &call);
    int askStatus(const QByteArray &ca);
    Call get(Call call, const QString &path, const QString &query) const;

    ServerAddress m_address;
    Findings m_findings;
};
