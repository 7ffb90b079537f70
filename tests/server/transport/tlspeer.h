// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificate.h"

#include <QByteArray>
#include <QList>
#include <QString>

#include <functional>
#include <memory>

// What the peer does once it has read a request.
struct PeerAnswer
{
    enum class End {
        CloseNotify, // the orderly end of TLS
        Abrupt,      // the connection just ends
        Reset,
        KeepOpen // go on reading requests
    };

    QByteArray bytes;
    End end = End::CloseNotify;
    QByteArray repeat; // sent over and over after `bytes` until the other side gives up
    int pauseMs = 0;   // after each time
    enum class Flood { None, Tickets, KeyUpdates } flood = Flood::None; // of TLS, after that
};

// A TLS server on loopback that does whatever a test asks of it, below HTTP too. It speaks in raw bytes,
// serves one connection after the other, in a thread of its own, and records every request that it reads,
// byte for byte.
class TlsPeer
{
public:
    enum class Style {
        Tls,
        OldTls,      // at most TLS 1.1
        ClientsOnly, // ends the handshake of clients that show no certificate
        ResetAfterHandshake,
        PlainText // without TLS; takes whatever bytes come for a request
    };
    using Script = std::function<PeerAnswer(const QByteArray &request)>; // may wait in it for the test
    struct Record
    {
        QList<QByteArray> requests;
        int connections = 0;
        QString clientName; // common name of the latest client certificate
    };

    // Asks clients for a certificate of the authority `clientCa`, when there is one.
    TlsPeer(const sandbox::KeyPair &identity, Script script, Style style = Style::Tls,
            const QByteArray &clientCa = {});
    ~TlsPeer();
    Q_DISABLE_COPY_MOVE(TlsPeer)

    quint16 port() const;
    QString url(const QString &path = QStringLiteral("/")) const; // by the name "localhost"

    Record record() const;
    int connections() const { return record().connections; }
    QList<QByteArray> requests() const { return record().requests; }

private:
    struct Engine;
    std::unique_ptr<Engine> m_engine;
};

// A complete reply with Content-Length.
QByteArray httpReply(int status, const QByteArray &body, const QByteArray &headerLines = {});
