// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "server/exchange.h"

namespace sandbox {

// The bytes of an answer as they go out. A fault leaves out what it keeps back: half of the header or of the
// body is missing, or there is nothing at all; a drip announces a body that never ends.
QByteArray wireOf(const Answer &answer, bool keepAlive);

} // namespace sandbox
