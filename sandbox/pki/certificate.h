// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

namespace sandbox {

// A certificate and the private key that belongs to it, both in PEM form (the key as unencrypted PKCS#8).
struct KeyPair
{
    QByteArray certificatePem;
    QByteArray keyPem;
};

// Facts about the first certificate of a PEM text; empty when there is none.
QByteArray certificateDer(const QByteArray &certificatePem);
// SHA-256 of the DER form, as upper-case hexadecimal pairs with colons between them.
QString certificateFingerprint(const QByteArray &certificatePem);
// The serial number as lower-case hexadecimal digits.
QString certificateSerial(const QByteArray &certificatePem);
QString certificateCommonName(const QByteArray &certificatePem);

// True when the private key belongs to the certificate.
bool keyFits(const QByteArray &certificatePem, const QByteArray &keyPem);

enum class FileAccess {
    Everyone, // mode 0644
    OwnerOnly // mode 0600 from the first moment on
};

// Writes a file whole or not at all, replacing an older one; folders must exist. On failure false and, unless
// null, `error`.
bool writePemFile(const QString &path, const QByteArray &pem, FileAccess access, QString *error);

} // namespace sandbox
