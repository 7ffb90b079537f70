// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

#include <openssl/bio.h>
#include <openssl/bn.h>
#include <openssl/evp.h>
#include <openssl/x509.h>

#include <memory>

namespace sandbox {

// Owners of OpenSSL's objects, and the way from and to PEM. For the sources of this folder only.
template <auto Release>
struct Releaser
{
    template <typename T>
    void operator()(T *object) const
    {
        Release(object);
    }
};

using BioPointer = std::unique_ptr<BIO, Releaser<BIO_free_all>>;
using BignumPointer = std::unique_ptr<BIGNUM, Releaser<BN_free>>;
using KeyPointer = std::unique_ptr<EVP_PKEY, Releaser<EVP_PKEY_free>>;
using CertificatePointer = std::unique_ptr<X509, Releaser<X509_free>>;

CertificatePointer readCertificate(const QByteArray &pem);
KeyPointer readKey(const QByteArray &pem);
QByteArray toPem(X509 *certificate);
QByteArray toPem(EVP_PKEY *key);

// "what: OpenSSL's reason", and leaves OpenSSL's error queue empty.
QString opensslError(const QString &what);

} // namespace sandbox
