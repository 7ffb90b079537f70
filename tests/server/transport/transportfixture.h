// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificateauthority.h"
#include "httpclientapi.h"
#include "logcapture.h"
#include "tlspeer.h"

#include <QTemporaryDir>

// Collects the warnings of this process while it lives.
class WarningLog : public LogCapture
{
public:
    QStringList lines() const;
    // The only line, or all of them in one text that no test expects.
    QString onlyLine() const;
};

// An authority, a server certificate of it for "localhost" and a directory for the files of a configuration.
class TransportFixture
{
    QTemporaryDir m_directory; // first: the files below are made in it

public:
    TransportFixture();

    QString path(const QString &name) const { return m_directory.filePath(name); }
    // Writes a file with the given mode and returns its path.
    QString file(const QString &name, const QByteArray &contents, mode_t mode = 0644) const;

    const sandbox::CertificateAuthority ca;
    const sandbox::KeyPair server;
    const QString caFile;

    // Trusts the authority.
    std::unique_ptr<HttpClientApi> client() const;

    static sandbox::CertificateAuthority authority(const QString &name)
    {
        return sandbox::CertificateAuthority::create(name);
    }
    static sandbox::KeyPair serverOf(const sandbox::CertificateAuthority &ca,
                                     const QString &name = QStringLiteral("localhost"))
    {
        return ca.issueServer({name});
    }
};

// Threads of this process, without those in `known`.
QStringList runningThreads(const QStringList &known = {});
// Waits, without processing events, until none of these threads runs any more; false when that takes too
// long.
bool haveEnded(const QStringList &threads);

// Answers every request alike.
TlsPeer::Script always(const QByteArray &bytes, PeerAnswer::End end = PeerAnswer::End::CloseNotify);
