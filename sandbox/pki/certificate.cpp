// SPDX-License-Identifier: Apache-2.0
#include "certificate.h"

#include "process.h"

#include <QSslCertificate>
#include <QSslKey>

namespace sandbox {

void KeyPair::save(const QString &certificatePath, const QString &keyPath) const
{
    smallfile::save(keyPath, keyPem, FileAccess::OwnerOnly);
    smallfile::save(certificatePath, certificatePem);
}

QByteArray certificateDer(const QByteArray &certificatePem)
{
    return QSslCertificate(certificatePem).toDer();
}

QString certificateFingerprint(const QByteArray &certificatePem)
{
    const QSslCertificate certificate(certificatePem);
    if (certificate.isNull())
        return {};
    return QString::fromLatin1(certificate.digest(QCryptographicHash::Sha256).toHex(':')).toUpper();
}

QString certificateSerial(const QByteArray &certificatePem)
{
    return QString::fromLatin1(QSslCertificate(certificatePem).serialNumber().replace(':', ""));
}

QString certificateCommonName(const QByteArray &certificatePem)
{
    return QSslCertificate(certificatePem).subjectInfo(QSslCertificate::CommonName).value(0);
}

bool keyFits(const QByteArray &certificatePem, const QByteArray &keyPem)
{
    const QSslCertificate certificate(certificatePem);
    if (certificate.isNull() || !keyPem.contains("PRIVATE KEY-----"))
        return false;
    vesk::base::Process openssl; // which would ask for the passphrase of an encrypted key on the terminal
    openssl.start(QStringLiteral("openssl"), {QStringLiteral("pkey"), QStringLiteral("-pubout"),
                                              QStringLiteral("-passin"), QStringLiteral("pass:")});
    openssl.write(keyPem);
    openssl.closeWriteChannel();
    return openssl.waitForFinished() && openssl.readAllStandardOutput() == certificate.publicKey().toPem();
}

} // namespace sandbox
