// SPDX-License-Identifier: Apache-2.0
#include "certificate.h"

#include "opensslpointers.h"

#include <QFile>
#include <QTemporaryFile>

#include <cerrno>
#include <cstdio>
#include <cstring>

namespace sandbox {

QByteArray certificateDer(const QByteArray &certificatePem)
{
    const CertificatePointer certificate = readCertificate(certificatePem);
    if (!certificate)
        return {};
    unsigned char *bytes = nullptr;
    const int size = i2d_X509(certificate.get(), &bytes);
    QByteArray der(reinterpret_cast<const char *>(bytes), qMax(size, 0));
    OPENSSL_free(bytes);
    return der;
}

QString certificateFingerprint(const QByteArray &certificatePem)
{
    const CertificatePointer certificate = readCertificate(certificatePem);
    QByteArray digest(EVP_MAX_MD_SIZE, '\0');
    unsigned int size = 0;
    if (!certificate || X509_digest(certificate.get(), EVP_sha256(),
                                    reinterpret_cast<unsigned char *>(digest.data()), &size) != 1)
        return {};
    return QString::fromLatin1(digest.left(static_cast<int>(size)).toHex(':')).toUpper();
}

QString certificateSerial(const QByteArray &certificatePem)
{
    const CertificatePointer certificate = readCertificate(certificatePem);
    if (!certificate)
        return {};
    const ASN1_INTEGER *serial = X509_get0_serialNumber(certificate.get());
    const BignumPointer number(ASN1_INTEGER_to_BN(serial, nullptr));
    char *digits = BN_bn2hex(number.get());
    QString text = QString::fromLatin1(digits).toLower();
    OPENSSL_free(digits);
    return text;
}

QString certificateCommonName(const QByteArray &certificatePem)
{
    const CertificatePointer certificate = readCertificate(certificatePem);
    if (!certificate)
        return {};
    const X509_NAME *subject = X509_get_subject_name(certificate.get());
    const int index = X509_NAME_get_index_by_NID(subject, NID_commonName, -1);
    if (index < 0)
        return {};
    unsigned char *text = nullptr;
    const int size =
        ASN1_STRING_to_UTF8(&text, X509_NAME_ENTRY_get_data(X509_NAME_get_entry(subject, index)));
    QString name = QString::fromUtf8(reinterpret_cast<const char *>(text), qMax(size, 0));
    OPENSSL_free(text);
    return name;
}

bool keyFits(const QByteArray &certificatePem, const QByteArray &keyPem)
{
    const CertificatePointer certificate = readCertificate(certificatePem);
    const KeyPointer key = readKey(keyPem);
    return certificate && key && X509_check_private_key(certificate.get(), key.get()) == 1;
}

bool writePemFile(const QString &path, const QByteArray &pem, FileAccess access, QString *error)
{
    const auto fail = [&](const QString &reason) {
        if (error != nullptr)
            *error = path + QStringLiteral(": ") + reason;
        return false;
    };
    QTemporaryFile file(path + QStringLiteral(".XXXXXX")); // made with mode 0600
    if (!file.open())
        return fail(file.errorString());
    if (access == FileAccess::Everyone &&
        !file.setPermissions(QFile::ReadOwner | QFile::WriteOwner | QFile::ReadGroup | QFile::ReadOther))
        return fail(file.errorString());
    if (file.write(pem) != pem.size() || !file.flush())
        return fail(file.errorString());
    if (std::rename(QFile::encodeName(file.fileName()).constData(), QFile::encodeName(path).constData()) != 0)
        return fail(QString::fromLocal8Bit(std::strerror(errno)));
    file.setAutoRemove(false);
    return true;
}

} // namespace sandbox
