// SPDX-License-Identifier: Apache-2.0
#include "opensslpointers.h"

#include <openssl/err.h>
#include <openssl/pem.h>

namespace sandbox {

namespace {

BioPointer readingBio(const QByteArray &pem)
{
    return BioPointer(BIO_new_mem_buf(pem.constData(), pem.size()));
}

QByteArray contents(BIO *bio)
{
    char *data = nullptr;
    const auto size = BIO_get_mem_data(bio, &data);
    return QByteArray(data, static_cast<int>(size));
}

// Without a callback OpenSSL would ask for the passphrase of an encrypted key on the terminal.
int noPassphrase(char *, int, int, void *)
{
    return -1;
}

} // namespace

CertificatePointer readCertificate(const QByteArray &pem)
{
    const BioPointer bio = readingBio(pem);
    CertificatePointer certificate(PEM_read_bio_X509(bio.get(), nullptr, noPassphrase, nullptr));
    ERR_clear_error();
    return certificate;
}

KeyPointer readKey(const QByteArray &pem)
{
    const BioPointer bio = readingBio(pem);
    KeyPointer key(PEM_read_bio_PrivateKey(bio.get(), nullptr, noPassphrase, nullptr));
    ERR_clear_error();
    return key;
}

QByteArray toPem(X509 *certificate)
{
    const BioPointer bio(BIO_new(BIO_s_mem()));
    if (PEM_write_bio_X509(bio.get(), certificate) != 1)
        return {};
    return contents(bio.get());
}

QByteArray toPem(EVP_PKEY *key)
{
    const BioPointer bio(BIO_new(BIO_s_secmem()));
    if (PEM_write_bio_PKCS8PrivateKey(bio.get(), key, nullptr, nullptr, 0, nullptr, nullptr) != 1)
        return {};
    return contents(bio.get());
}

QString opensslError(const QString &what)
{
    const unsigned long code = ERR_get_error();
    const char *reason = code == 0 ? nullptr : ERR_reason_error_string(code);
    ERR_clear_error();
    return reason == nullptr ? what : what + QStringLiteral(": ") + QString::fromLatin1(reason);
}

} // namespace sandbox
