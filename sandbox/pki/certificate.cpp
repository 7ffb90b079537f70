// SPDX-License-Identifier: Apache-2.0
#include "certificate.h"

#include "process.h"

#include <QSslCertificate>

namespace sandbox {

namespace {

// What it makes of the input; nothing when it cannot read it.
QByteArray openssl(const char *arguments, const QByteArray &input)
{
    vesk::base::Process process;
    process.start(QStringLiteral("openssl"), QString::fromLatin1(arguments).split(QLatin1Char(' ')));
    process.write(input);
    process.closeWriteChannel();
    return process.waitForFinished() ? process.readAllStandardOutput() : QByteArray();
}

} // namespace

void KeyPair::save(const QString &certificatePath, const QString &keyPath) const
{
    smallfile::save(keyPath, keyPem, FileAccess::OwnerOnly);
    smallfile::save(certificatePath, certificatePem);
}

QByteArray certificateDer(const QByteArray &certificatePem)
{
    return QSslCertificate(certificatePem).toDer();
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
    const QByteArray publicKey = openssl("x509 -noout -pubkey", QSslCertificate(certificatePem).toPem());
    // Without "-passin" the passphrase of an encrypted key is asked for on the terminal.
    return !publicKey.isEmpty() && keyPem.contains("PRIVATE KEY-----") &&
           openssl("pkey -pubout -passin pass:", keyPem) == publicKey;
}

} // namespace sandbox
