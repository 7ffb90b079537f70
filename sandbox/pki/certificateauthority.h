// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificate.h"

#include <QDateTime>
#include <QStringList>

namespace sandbox {

// The time in which a certificate is valid. The default reaches from an hour ago (clocks differ) for ten
// years. Past and future windows make expired and not yet valid certificates.
struct Validity
{
    QDateTime from = QDateTime::currentDateTimeUtc().addSecs(-3600);
    QDateTime to = QDateTime::currentDateTimeUtc().addYears(10);
};

// A certificate authority with a key on the curve P-256: made by the sandbox at its first start and by tests
// as they need it. Issues certificates with new keys of their own and random 128 bit serial numbers, keeps no
// list of them, and writes files only in save(). Throws an Error where something cannot be done.
class CertificateAuthority
{
public:
    static CertificateAuthority create(const QString &commonName, const Validity &validity = {});
    // Reads what save() wrote; refuses a certificate that is no CA and a key that does not belong to it.
    static CertificateAuthority load(const QString &certificatePath, const QString &keyPath);
    // The certificate becomes readable by all, the key by its owner only, from the first moment on.
    void save(const QString &certificatePath, const QString &keyPath) const;

    QByteArray certificatePem() const { return m_pair.certificatePem; }

    // `names` are DNS names and IP addresses; each becomes a subject alternative name of its kind, and the
    // first of them the common name.
    KeyPair issueServer(const QStringList &names, const Validity &validity = {}) const;
    KeyPair issueClient(const QString &commonName, const Validity &validity = {}) const;

    // A self-signed server certificate.
    static KeyPair selfSigned(const QStringList &names, const Validity &validity = {});

private:
    explicit CertificateAuthority(KeyPair pair)
        : m_pair(std::move(pair))
    {
    }

    KeyPair m_pair;
};

} // namespace sandbox
