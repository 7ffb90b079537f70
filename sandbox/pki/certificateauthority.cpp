// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"

#include "certificatebuilder.h"

#include <QFile>

#include <openssl/x509v3.h>

namespace sandbox {

namespace {

bool readFile(const QString &path, QByteArray *contents, QString *error)
{
    QFile file(path);
    if (file.open(QIODevice::ReadOnly)) {
        *contents = file.readAll();
        return true;
    }
    if (error != nullptr)
        *error = path + QStringLiteral(": ") + file.errorString();
    return false;
}

bool isAuthority(const QByteArray &certificatePem)
{
    const CertificatePointer certificate = readCertificate(certificatePem);
    return certificate && X509_check_ca(certificate.get()) == 1;
}

CertificateRequest serverRequest(const QStringList &names, const Validity &validity)
{
    return {Purpose::Server, names.value(0), names, validity};
}

} // namespace

std::optional<CertificateAuthority> CertificateAuthority::create(const QString &commonName, QString *error,
                                                                 const Validity &validity)
{
    auto pair = buildCertificate({Purpose::Authority, commonName, {}, validity}, nullptr, error);
    if (!pair)
        return std::nullopt;
    return CertificateAuthority(std::move(*pair));
}

std::optional<CertificateAuthority> CertificateAuthority::load(const QString &certificatePath,
                                                               const QString &keyPath, QString *error)
{
    KeyPair pair;
    if (!readFile(certificatePath, &pair.certificatePem, error) || !readFile(keyPath, &pair.keyPem, error))
        return std::nullopt;
    QString reason;
    if (!isAuthority(pair.certificatePem))
        reason = certificatePath + QStringLiteral(": not the certificate of an authority");
    else if (!keyFits(pair.certificatePem, pair.keyPem))
        reason = keyPath + QStringLiteral(": not the private key of ") + certificatePath;
    if (reason.isEmpty())
        return CertificateAuthority(std::move(pair));
    if (error != nullptr)
        *error = reason;
    return std::nullopt;
}

bool CertificateAuthority::save(const QString &certificatePath, const QString &keyPath, QString *error) const
{
    return writePemFile(keyPath, m_pair.keyPem, FileAccess::OwnerOnly, error) &&
           writePemFile(certificatePath, m_pair.certificatePem, FileAccess::Everyone, error);
}

std::optional<KeyPair> CertificateAuthority::issueServer(const QStringList &names, QString *error,
                                                         const Validity &validity) const
{
    return buildCertificate(serverRequest(names, validity), &m_pair, error);
}

std::optional<KeyPair> CertificateAuthority::issueClient(const QString &commonName, QString *error,
                                                         const Validity &validity) const
{
    return buildCertificate({Purpose::Client, commonName, {}, validity}, &m_pair, error);
}

std::optional<KeyPair> CertificateAuthority::selfSigned(const QStringList &names, QString *error,
                                                        const Validity &validity)
{
    return buildCertificate(serverRequest(names, validity), nullptr, error);
}

} // namespace sandbox
