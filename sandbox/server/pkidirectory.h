// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificateauthority.h"
#include "scenario/scenario.h"

namespace sandbox {

// The server's own certificates in its directory: ca.crt and ca.key, enrolment.crt/.key, managed.crt/.key.
// Made when they are missing; a server certificate is also made again when it does not cover all the names or
// has expired. Used once, when the server starts. Damaged files are an error and stay as they are.
struct PkiDirectory
{
    CertificateAuthority authority;
    KeyPair enrolment;
    KeyPair managed;

    static std::optional<PkiDirectory> open(const QString &directory, const QStringList &names,
                                            QString *error);

    // Certificate and key of a server whose certificate has the fault, and no other one; an empty pair for
    // faults that are not in the certificate. `names` are those that the good certificate covers. Nothing,
    // with `error` set, when it cannot be made.
    std::optional<KeyPair> faulty(ConnectionFault fault, const QStringList &names, QString *error) const;
};

} // namespace sandbox
