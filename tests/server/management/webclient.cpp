// SPDX-License-Identifier: Apache-2.0
#include "webclient.h"

#include <QJsonDocument>

#include <curl/curl.h>

#include <memory>

namespace {

constexpr long kPatienceMs = 30L * 1000; // with a server that hangs

std::size_t collect(char *data, std::size_t size, std::size_t count, void *target)
{
    static_cast<QByteArray *>(target)->append(data, static_cast<int>(size * count));
    return size * count;
}

int onProgress(void *client, curl_off_t, curl_off_t, curl_off_t, curl_off_t)
{
    const auto &givesUp = static_cast<const WebClient *>(client)->givesUp;
    return givesUp && givesUp() ? 1 : 0;
}

curl_blob blobOf(const QByteArray &bytes)
{
    return {const_cast<char *>(bytes.constData()), static_cast<std::size_t>(bytes.size()), CURL_BLOB_COPY};
}

void setBlob(CURL *handle, CURLoption option, const QByteArray &bytes)
{
    curl_blob blob = blobOf(bytes);
    curl_easy_setopt(handle, option, &blob);
}

} // namespace

QJsonObject WebClient::Answer::json() const
{
    return QJsonDocument::fromJson(body).object();
}

WebClient::Answer WebClient::send(const QByteArray &method, const QByteArray &target,
                                  const QByteArray &body) const
{
    const std::unique_ptr<CURL, decltype(&curl_easy_cleanup)> handle(curl_easy_init(), &curl_easy_cleanup);
    Answer answer;
    char trouble[CURL_ERROR_SIZE] = "";
    const QByteArray url = "https://" + host.toUtf8() + ':' + QByteArray::number(port) + target;
    curl_easy_setopt(handle.get(), CURLOPT_URL, url.constData());
    curl_easy_setopt(handle.get(), CURLOPT_PROXY, "");
    curl_easy_setopt(handle.get(), CURLOPT_CUSTOMREQUEST, method.constData());
    curl_easy_setopt(handle.get(), CURLOPT_TIMEOUT_MS, kPatienceMs);
    curl_easy_setopt(handle.get(), CURLOPT_NOPROGRESS, 0L);
    curl_easy_setopt(handle.get(), CURLOPT_XFERINFOFUNCTION, onProgress);
    curl_easy_setopt(handle.get(), CURLOPT_XFERINFODATA, this);
    curl_easy_setopt(handle.get(), CURLOPT_NOSIGNAL, 1L);
    curl_easy_setopt(handle.get(), CURLOPT_ERRORBUFFER, trouble);
    curl_easy_setopt(handle.get(), CURLOPT_WRITEFUNCTION, collect);
    curl_easy_setopt(handle.get(), CURLOPT_WRITEDATA, &answer.body);
    curl_easy_setopt(handle.get(), CURLOPT_HEADERFUNCTION, collect);
    curl_easy_setopt(handle.get(), CURLOPT_HEADERDATA, &answer.header);
    if (!body.isEmpty()) {
        curl_easy_setopt(handle.get(), CURLOPT_POSTFIELDSIZE, static_cast<long>(body.size()));
        curl_easy_setopt(handle.get(), CURLOPT_POSTFIELDS, body.constData());
    }
    setBlob(handle.get(), CURLOPT_CAINFO_BLOB, caPem);
    if (!credentials.certificatePem.isEmpty()) {
        setBlob(handle.get(), CURLOPT_SSLCERT_BLOB, credentials.certificatePem);
        setBlob(handle.get(), CURLOPT_SSLKEY_BLOB, credentials.keyPem);
    }
    answer.curlCode = curl_easy_perform(handle.get());
    long status = 0;
    curl_easy_getinfo(handle.get(), CURLINFO_RESPONSE_CODE, &status);
    answer.status = static_cast<int>(status);
    answer.trouble = trouble;
    return answer;
}
