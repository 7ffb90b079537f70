// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/smallfile.h"

#include <QByteArray>
#include <QString>

namespace sandbox {

// A certificate and the private key that belongs to it, both in PEM form (the key as unencrypted PKCS#8).
struct KeyPair
{
    QByteArray certificatePem;
    QByteArray keyPem;

    // The certificate becomes readable by all, the key by its owner only, from the first moment on. Existing
    // files are replaced. Throws an Error.
    void save(const QString &certificatePath, const QString &keyPath) const;
};

// Information about the first certificate of a PEM text; empty when there is none.
QByteArray certificateDer(const QByteArray &certificatePem);
// The serial number as lower-case hexadecimal digits.
QString certificateSerial(const QByteArray &certificatePem);
QString certificateCommonName(const QByteArray &certificatePem);

// True when the private key belongs to the certificate.
bool keyFits(const QByteArray &certificatePem, const QByteArray &keyPem);

} // namespace sandbox
