// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificateauthority.h"
#include "scenario/scenario.h"

namespace sandbox {

// The server's own certificates in its directory: ca.crt and ca.key, enrolment.crt/.key, managed.crt/.key.
// Made when they are missing; a server certificate is also made again when it does not cover all the names or
// has expired. Used once, when the server starts. Damaged files stay as they are. Everything here throws an
// Error.
struct PkiDirectory
{
    PkiDirectory(const QString &directory, const QStringList &names);

    // Certificate and key of a server whose certificate has the fault, and no other one; an empty pair for
    // faults that are not in the certificate. `names` are those that the good certificate covers.
    KeyPair faulty(ConnectionFault fault, const QStringList &names) const;

    CertificateAuthority authority;
    KeyPair enrolment;
    KeyPair managed;
};

} // namespace sandbox
