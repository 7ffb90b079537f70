// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificateauthority.h"
#include "server/domain.h"
#include "server/exchange.h"

namespace sandbox {

// What the eight endpoints of the server do with a request. Each function answers one of them, throws
// Refused, or an Error when the server itself fails. They presume that Dispatcher has looked at path, method
// and certificate, and never touch the network.
class Endpoints
{
public:
    // `issuedDirectory` takes the certificates of terminals, but never their keys.
    Endpoints(Domain &domain, CertificateAuthority authority, QString issuedDirectory);

    Reply caCertificate(const Request &request);
    Reply status(const Request &request);
    Reply auth(const Request &request);
    Reply join(const Request &request);
    Reply rule(const Request &request);
    Reply verifyName(const Request &request);
    Reply removeStatus(const Request &request);
    Reply remove(const Request &request);

private:
    void refuseUnfit(const QJsonObject &terminal) const;
    void refuseUnfitAlias(const QString &alias) const;

    Domain &m_domain;
    CertificateAuthority m_authority;
    QString m_issuedDirectory;
};

} // namespace sandbox
