// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"
#include "finding.h"

// What the transport makes of the installed CA, certificate and key, for this user: the finding "transport".
// Fills `credentials` with what a request would be made with, but for one that is refused, which is a fault.
// needsPair: it is a fault as well when there is no client certificate.
Finding transportFinding(bool needsPair, Credentials &credentials);
