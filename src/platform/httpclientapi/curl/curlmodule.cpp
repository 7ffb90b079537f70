// SPDX-License-Identifier: Apache-2.0
#include "curlexchange.h"

#include <QByteArray>

#include <curl/curl.h>

namespace {

constexpr char kKeyLogVariable[] = "SSLKEYLOGFILE";

// libcurl opens the key log while it is set up, and only then.
bool initWithoutKeyLog()
{
    const QByteArray keyLog = qgetenv(kKeyLogVariable);
    const bool wasSet = qEnvironmentVariableIsSet(kKeyLogVariable);
    qunsetenv(kKeyLogVariable);
    const CURLcode code = curl_global_init(CURL_GLOBAL_DEFAULT);
    if (wasSet)
        qputenv(kKeyLogVariable, keyLog);
    return code == CURLE_OK;
}

} // namespace

extern "C" {

Q_DECL_EXPORT bool httpclientapiPrepare()
{
    return initWithoutKeyLog();
}

Q_DECL_EXPORT void httpclientapiExchange(const ExchangeRequest &request, ExchangeOutcome &outcome)
{
    exchangeByCurl(request, outcome);
}
}
