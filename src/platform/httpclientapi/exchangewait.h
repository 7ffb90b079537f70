// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"

// Runs one exchange in a thread of its own and returns when it has ended. With `keepWindowAlive`, in the
// application's thread, events are processed and the user's input is discarded meanwhile; otherwise the
// calling thread just waits.
ExchangeOutcome waitForExchange(ExchangeFunction exchange, const ExchangeRequest &request,
                                bool keepWindowAlive);
