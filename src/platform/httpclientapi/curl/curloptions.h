// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"
#include "owned.h"

#include <curl/curl.h>

// For reaching the server: name, TCP, TLS, and what a proxy adds to them.
constexpr long kReachLimitMs = 10L * 1000;

using HeaderList = Owned<curl_slist, curl_slist_free_all>;

// Everything of an exchange that is decided before it starts. False when libcurl refuses an option: a request
// must not go out with one of its rules missing. `request` and `headers` must outlive the use of the handle.
bool setOptions(CURL *handle, const ExchangeRequest &request, const HeaderList &headers);

// The header lines beside libcurl's own; a line without a value takes one of libcurl's away.
HeaderList headersFor(const ExchangeRequest &request);
