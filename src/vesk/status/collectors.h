// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "finding.h"

// What there is to look at beside record and identity. Each looks, changes nothing and never asks for a
// right: what this user may not read is State::Unknown.

// CA, certificate and key of a terminal that has joined, and what the transport makes of them.
Findings credentialFindings(Joined joined);
// The directory in which a join stages its files, and what has been left there.
Findings stagingFindings();
// Services on the system bus and on that of the session.
Findings serviceFindings();
// Settings schemas, their keys, and the login switches of this user.
Findings desktopFindings();
// Per-user services, and whether this user may take the terminal out of the domain.
Findings commandFindings(Joined joined);

// CA and certificate, if they expire within so many days or have expired.
Findings expiringCredentials(int days);
