// SPDX-License-Identifier: Apache-2.0
#include "curloptions.h"

namespace {

struct Rule
{
    CURLoption option;
    long value;
};

// What holds for every exchange.
constexpr Rule kRules[] = {
    {CURLOPT_HTTP_VERSION, CURL_HTTP_VERSION_1_1},
    {CURLOPT_FOLLOWLOCATION, 0},
    {CURLOPT_HTTP_CONTENT_DECODING, 0},
    {CURLOPT_FRESH_CONNECT, 1},
    {CURLOPT_FORBID_REUSE, 1},
    {CURLOPT_SUPPRESS_CONNECT_HEADERS, 1},
    {CURLOPT_NOSIGNAL, 1},
    {CURLOPT_CONNECTTIMEOUT_MS, kReachLimitMs},
    {CURLOPT_QUICK_EXIT, 1}, // leaves a resolver that hangs behind instead of waiting for it
    {CURLOPT_SSLVERSION, CURL_SSLVERSION_TLSv1_2},
    {CURLOPT_SSL_SESSIONID_CACHE, 0},
};

// Sets options until one is refused.
class Options
{
public:
    explicit Options(CURL *handle)
        : m_handle(handle)
    {
    }

    template <typename Value>
    Options &set(CURLoption option, Value value)
    {
        m_ok = m_ok && curl_easy_setopt(m_handle, option, value) == CURLE_OK;
        return *this;
    }

    // Not copied: the bytes belong to the request. An empty one is not set.
    Options &setBlob(CURLoption option, const QByteArray &bytes)
    {
        if (bytes.isEmpty())
            return *this;
        curl_blob blob{const_cast<char *>(bytes.constData()), static_cast<size_t>(bytes.size()),
                       CURL_BLOB_NOCOPY};
        return set(option, &blob);
    }

    bool ok() const { return m_ok; }

private:
    CURL *m_handle;
    bool m_ok = true;
};

void setTls(Options &options, const Credentials &credentials)
{
    options
        .set(CURLOPT_CAINFO, static_cast<const char *>(nullptr)) // the system's bundle is the default
        .set(CURLOPT_CAPATH, static_cast<const char *>(nullptr))
        .set(CURLOPT_SSL_VERIFYPEER, credentials.verifyPeer ? 1L : 0L)
        .set(CURLOPT_SSL_VERIFYHOST, credentials.verifyPeer ? 2L : 0L)
        .set(CURLOPT_KEYPASSWD, "") // otherwise OpenSSL may ask on the terminal
        .setBlob(CURLOPT_CAINFO_BLOB, credentials.ca)
        .setBlob(CURLOPT_SSLCERT_BLOB, credentials.certificate)
        .setBlob(CURLOPT_SSLKEY_BLOB, credentials.key);
}

void setRequest(Options &options, const ExchangeRequest &request)
{
    options.set(CURLOPT_URL, request.url.constData());
    if (request.method == "GET" && request.body.isEmpty()) {
        options.set(CURLOPT_HTTPGET, 1L);
        return;
    }
    options.set(CURLOPT_POSTFIELDS, request.body.constData())
        .set(CURLOPT_POSTFIELDSIZE_LARGE, static_cast<curl_off_t>(request.body.size()))
        .set(CURLOPT_CUSTOMREQUEST, request.method.constData());
}

} // namespace

bool setOptions(CURL *handle, const ExchangeRequest &request, const HeaderList &headers)
{
    Options options(handle);
    for (const Rule &rule : kRules)
        options.set(rule.option, rule.value);
    options.set(CURLOPT_PROTOCOLS_STR, "https")
        .set(CURLOPT_TIMEOUT_MS, static_cast<long>(request.limitMs))
        .set(CURLOPT_HTTPHEADER, headers.get());
    setTls(options, request.credentials);
    setRequest(options, request);
    return options.ok();
}

HeaderList headersFor(const ExchangeRequest &request)
{
    HeaderList headers;
    for (const char *line :
         {"Expect:", request.body.isEmpty() ? "Content-Type:" : "Content-Type: application/json"}) {
        curl_slist *longer = curl_slist_append(headers.get(), line);
        if (longer == nullptr)
            return nullptr;
        (void)headers.release(); // now part of the longer list
        headers.reset(longer);
    }
    return headers;
}
