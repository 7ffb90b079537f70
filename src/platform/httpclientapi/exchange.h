// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// What libhttpclientapi.so and the module that holds libcurl say to each other. Plain values; the module
// keeps nothing between two exchanges.

struct ExchangeRequest
{
    QByteArray method;
    QByteArray url;  // encoded, https, with a host
    QByteArray body; // UTF-8; none is sent when it is empty
    int limitMs = 0; // of the whole exchange

    bool verifyPeer = true;
    QByteArray ca; // PEM; needed when the peer is verified
    QByteArray certificate;
    QByteArray key; // both empty: no client certificate
};

struct ExchangeOutcome
{
    enum class Stage {
        NothingSent,
        Sent,    // no answer that could be made out: the server may have acted or not
        Answered // `status` is known; the rest of the reply may still be unusable
    };
    enum class Culprit { Other, CaFile, ClientPair, Peer };

    Stage stage = Stage::NothingSent;
    int status = 0;
    QByteArray body;
    QString failure; // empty when the reply is complete
    Culprit culprit = Culprit::Other;
    QString peerFingerprint; // SHA-256 of the certificate of a peer that was not verified
};

// The module's two entries. Prepare is called once, in the thread that loads the module, and is false when
// libcurl cannot be set up; exchanges run in threads of their own and never throw.
using PrepareFunction = bool (*)();
using ExchangeFunction = void (*)(const ExchangeRequest &, ExchangeOutcome &);
constexpr char kPrepareSymbol[] = "httpclientapiPrepare";
constexpr char kExchangeSymbol[] = "httpclientapiExchange";
