// SPDX-License-Identifier: Apache-2.0
#pragma once

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

    struct Material
    {
        Trust trust = Trust::Refused;
        QByteArray ca;
        QByteArray certificate;
        QByteArray key;
        QString reason; // of the refusal
        QString advice; // of a file that is used
    };

    SslConfiguration() = default; // names nothing: every request is refused
    SslConfiguration(const QString &caFile, const QString &certificateFile, const QString &keyFile);

    const Material &material();

    // What is to be said about the files that are used. Empty after the first time.
    QString takeAdvice() { return std::exchange(m_material.advice, {}); }

    QString caFile() const { return m_caFile; }
    QString certificateFile() const { return m_certificateFile; }

private:
    Material read() const;
    QString namingFault() const;
    Material judge(const PemFile &ca, const PemFile &certificate, const PemFile &key) const;

    QString m_caFile;
    QString m_certificateFile;
    QString m_keyFile;
    Material m_material;
};
