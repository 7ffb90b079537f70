// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificateauthority.h"

namespace sandbox {

// The server's own certificates in its folder: ca.crt and ca.key, enrolment.crt/.key, managed.crt/.key. Made
// when they are missing; a server certificate is also made anew when it does not cover all the names or has
// expired. Used once, when the server starts. Damaged files are an error and stay as they are.
struct PkiFolder
{
    CertificateAuthority authority;
    KeyPair enrolment;
    KeyPair managed;

    static std::optional<PkiFolder> open(const QString &folder, const QStringList &serverNames,
                                         QString *error);
};

} // namespace sandbox
