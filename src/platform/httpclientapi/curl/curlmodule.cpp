// SPDX-License-Identifier: Apache-2.0
#include "curlexchange.h"

extern "C" Q_DECL_EXPORT ExchangeFunction httpclientapiPrepare()
{
    return setUpCurl() ? exchangeByCurl : nullptr;
}
