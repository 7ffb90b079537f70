// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// What libhttpclientapi.so and the module that holds libcurl say to each other. Plain values; the module
// keeps nothing between two exchanges.

// What the two ends of a connection prove themselves with, in PEM form.
struct Credentials
{
    bool verifyPeer = true;
    QByteArray ca; // needed when the peer is verified
    QByteArray certificate;
    QByteArray key; // both empty: no client certificate
};

struct ExchangeRequest
{
    QByteArray method;
    QByteArray url;  // encoded, https, with a host
    QByteArray body; // UTF-8; none is sent when it is empty
    int limitMs = 0; // of the whole exchange
    Credentials credentials;
};

struct ExchangeOutcome
{
    enum class Stage {
        NothingSent,
        Sent,    // no answer that could be made out: the server may have acted or not
        Answered // `status` is known; the rest of the reply may still be unusable
    };
    enum class FailureSource { Other, CaFile, ClientPair, Peer };

    Stage stage = Stage::NothingSent;
    int status = 0;
    QByteArray body;
    QString failure; // empty when the reply is complete
    FailureSource source = FailureSource::Other;
    QString peerFingerprint; // SHA-256 of the certificate of a peer that was not verified
};

// An exchange never throws and runs in any thread.
using ExchangeFunction = void (*)(const ExchangeRequest &, ExchangeOutcome &);

// The module's one entry, called once, in the thread that loads the module. Null when libcurl cannot be set
// up.
using PrepareFunction = ExchangeFunction (*)();
constexpr char kPrepareSymbol[] = "httpclientapiPrepare";
