// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificate.h"

#include <QDateTime>
#include <QStringList>

#include <optional>

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
// list of them, and writes files only in save(). Functions return nothing (or false) on failure and then fill
// `error`, which may be null; nothing throws.
class CertificateAuthority
{
public:
    static std::optional<CertificateAuthority> create(const QString &commonName, QString *error,
                                                      const Validity &validity = {});
    // Reads what save() wrote; refuses a certificate that is no CA and a key that does not belong to it.
    static std::optional<CertificateAuthority> load(const QString &certificatePath, const QString &keyPath,
                                                    QString *error);
    // The certificate becomes readable by all, the key by its owner only, from the first moment on.
    bool save(const QString &certificatePath, const QString &keyPath, QString *error) const;

    QByteArray certificatePem() const { return m_pair.certificatePem; }

    // `names` are DNS names and IP addresses; each becomes a subject alternative name of its kind, and the
    // first of them the common name.
    std::optional<KeyPair> issueServer(const QStringList &names, QString *error,
                                       const Validity &validity = {}) const;
    std::optional<KeyPair> issueClient(const QString &commonName, QString *error,
                                       const Validity &validity = {}) const;

    // A self-signed server certificate.
    static std::optional<KeyPair> selfSigned(const QStringList &names, QString *error,
                                             const Validity &validity = {});

private:
    explicit CertificateAuthority(KeyPair pair)
        : m_pair(std::move(pair))
    {
    }

    KeyPair m_pair;
};

} // namespace sandbox
