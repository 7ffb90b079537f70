// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificateauthority.h"
#include "scenario/scenario.h"

namespace sandbox {

// Certificate and key of a server whose certificate has the fault, and no other one; an empty pair for faults
// that are not in the certificate. `names` are those that the good certificate covers. Nothing, with `error`
// set, when it cannot be made.
std::optional<KeyPair> faultyCredentials(ConnectionFault fault, const CertificateAuthority &authority,
                                         const QStringList &names, QString *error);

} // namespace sandbox
