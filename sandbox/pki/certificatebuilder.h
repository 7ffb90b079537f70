// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificateauthority.h"
#include "opensslpointers.h"

namespace sandbox {

enum class Purpose { Authority, Server, Client };

// What a new certificate says. `alternativeNames` are DNS names and IP addresses.
struct CertificateRequest
{
    Purpose purpose = Purpose::Server;
    QString commonName;
    QStringList alternativeNames;
    Validity validity;
};

// Makes a new key on the curve P-256 and a certificate for it, signed by `issuer`; without one the
// certificate signs itself. Nothing, and a filled `error` (may be null), on failure.
std::optional<KeyPair> buildCertificate(const CertificateRequest &request, const KeyPair *issuer,
                                        QString *error);

} // namespace sandbox
