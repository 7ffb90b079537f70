// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"

// One exchange over a fresh handle of libcurl, and so over a connection of its own, which is closed before
// the function returns. Blocks; may run in several threads at once.
void exchangeByCurl(const ExchangeRequest &request, ExchangeOutcome &outcome);
