// SPDX-License-Identifier: Apache-2.0
#include "tlswatch.h"

#include "owned.h"

#include <openssl/x509.h>

#include <array>

namespace {

constexpr int kAlertMask = 0xff; // the lower byte of an alert says which, the upper how grave

} // namespace

bool TlsWatch::attach(CURL *handle)
{
    m_handle = handle;
    return curl_easy_setopt(handle, CURLOPT_SSL_CTX_FUNCTION, onContextMade) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_SSL_CTX_DATA, this) == CURLE_OK;
}

CURLcode TlsWatch::onContextMade(CURL *, void *context, void *watch)
{
    auto *made = static_cast<SSL_CTX *>(context);
    SSL_CTX_set_keylog_callback(made, nullptr); // somebody else in this process may have had libcurl open one
    static_cast<TlsWatch *>(watch)->m_hasBegun = true;
    // Otherwise one read lasts for as long as tickets or key updates come.
    SSL_CTX_clear_mode(made, SSL_MODE_AUTO_RETRY);
    SSL_CTX_set_app_data(made, watch);
    SSL_CTX_set_info_callback(made, onEvent);
    return CURLE_OK;
}

void TlsWatch::onEvent(const SSL *ssl, int where, int value)
{
    auto *watch = static_cast<TlsWatch *>(SSL_CTX_get_app_data(SSL_get_SSL_CTX(ssl)));
    if (ssl == watch->m_connection && where == SSL_CB_READ_ALERT &&
        (value & kAlertMask) == SSL_AD_CLOSE_NOTIFY)
        watch->m_endedInOrder = true;
}

SSL *TlsWatch::connection() const
{
    curl_tlssessioninfo *session = nullptr;
    return curl_easy_getinfo(m_handle, CURLINFO_TLS_SSL_PTR, &session) == CURLE_OK
               ? static_cast<SSL *>(session->internals)
               : nullptr;
}

QString TlsWatch::peerFingerprint() const
{
    const SSL *ssl = connection();
    const Owned<X509, X509_free> certificate(ssl == nullptr ? nullptr : SSL_get1_peer_certificate(ssl));
    if (!certificate)
        return {};
    std::array<unsigned char, EVP_MAX_MD_SIZE> digest = {};
    unsigned int size = 0;
    X509_digest(certificate.get(), EVP_sha256(), digest.data(), &size);
    const QByteArray bytes(reinterpret_cast<const char *>(digest.data()), static_cast<int>(size));
    return QString::fromLatin1(bytes.toHex(':')).toUpper();
}
