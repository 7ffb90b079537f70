// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"

// The module with libcurl, loaded at the first request and kept until the process ends: linking it would make
// every start of the program slower. Null, and a filled `error`, when it is missing or unusable.
ExchangeFunction exchangeFunction(QString *error);
