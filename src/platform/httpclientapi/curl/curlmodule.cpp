// SPDX-License-Identifier: Apache-2.0
#include "curlexchange.h"

#include <QByteArray>

#include <curl/curl.h>

extern "C" Q_DECL_EXPORT ExchangeFunction httpclientapiPrepare()
{
    // libcurl opens the key log while it is set up, and only then.
    constexpr char kKeyLogVariable[] = "SSLKEYLOGFILE";
    const QByteArray keyLog = qgetenv(kKeyLogVariable);
    const bool wasSet = qEnvironmentVariableIsSet(kKeyLogVariable);
    qunsetenv(kKeyLogVariable);
    const CURLcode code = curl_global_init(CURL_GLOBAL_DEFAULT);
    if (wasSet)
        qputenv(kKeyLogVariable, keyLog);
    return code == CURLE_OK ? exchangeByCurl : nullptr;
}
