// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

#include <curl/curl.h>
#include <openssl/ssl.h>

// Stands beside the TLS connection of one exchange, knows what libcurl does not tell, and takes its key log
// away. Must outlive the use of the handle.
class TlsWatch
{
public:
    // False when libcurl refuses.
    bool attach(CURL *handle);

    // A handshake, with the server or with a proxy, was about to begin: TCP is there.
    bool hasBegun() const { return m_hasBegun; }

    // To be called between the handshake with the server and the request. What came before is a proxy's.
    void requestStarts() { m_connection = connection(); }

    // SHA-256 of the server's certificate; between the handshake and the end of the connection.
    QString peerFingerprint() const;

    // The server has said that it sends nothing more. A connection that ends without that may have been cut,
    // which libcurl takes for an end like any other.
    bool endedInOrder() const { return m_endedInOrder; }

private:
    static CURLcode onContextMade(CURL *handle, void *context, void *watch);
    static void onEvent(const SSL *ssl, int where, int value);

    SSL *connection() const;

    CURL *m_handle = nullptr;
    const SSL *m_connection = nullptr; // to the server
    bool m_hasBegun = false;
    bool m_endedInOrder = false;
};
