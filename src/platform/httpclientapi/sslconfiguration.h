// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"
#include "pemfile.h"

#include <QString>

#include <utility>

// The three files of HttpClientApi::setSSLConfig() and what follows from them for a request. Files are read
// when they are named; as long as that does not give a verified configuration they are read again when asked
// for.
class SslConfiguration
{
public:
    enum class Trust { Verified, FirstContact, Refused };

    struct Resolved
    {
        Trust trust = Trust::Refused;
        Credentials credentials;
        QString reason; // of the refusal
        QString advice; // about a file that is used
    };

    SslConfiguration() = default; // names nothing: every request is refused
    SslConfiguration(const QString &caFile, const QString &certificateFile, const QString &keyFile);

    const Resolved &resolved();

    // What is to be said about the files that are used. Empty after the first time.
    QString takeAdvice() { return std::exchange(m_resolved.advice, {}); }

    QString caFile() const { return m_caFile; }
    QString certificateFile() const { return m_certificateFile; }

private:
    QString namingFault() const;
    Resolved read() const;
    Resolved resolve(const PemFile &ca, const PemFile &certificate, const PemFile &key) const;

    QString m_caFile;
    QString m_certificateFile;
    QString m_keyFile;
    Resolved m_resolved;
};
