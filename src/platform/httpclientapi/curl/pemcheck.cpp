// SPDX-License-Identifier: Apache-2.0
#include "pemcheck.h"

#include "owned.h"

#include <openssl/err.h>
#include <openssl/pem.h>
#include <openssl/x509.h>

namespace {

using BioPointer = Owned<BIO, BIO_free_all>;

BioPointer reading(const QByteArray &pem)
{
    return BioPointer(BIO_new_mem_buf(pem.constData(), pem.size()));
}

void release(STACK_OF(X509_INFO) * entries)
{
    sk_X509_INFO_pop_free(entries, X509_INFO_free);
}

} // namespace

int noPassphrase(char *, int, int, void *)
{
    return -1;
}

bool holdsCertificates(const QByteArray &pem)
{
    const BioPointer bio = reading(pem);
    STACK_OF(X509_INFO) *entries = PEM_X509_INFO_read_bio(bio.get(), nullptr, noPassphrase, nullptr);
    bool found = false;
    for (int i = 0; i < sk_X509_INFO_num(entries); ++i)
        found = found || sk_X509_INFO_value(entries, i)->x509 != nullptr;
    release(entries);
    ERR_clear_error();
    return found;
}

bool isPair(const QByteArray &certificatePem, const QByteArray &keyPem)
{
    const BioPointer certificateBio = reading(certificatePem);
    const BioPointer keyBio = reading(keyPem);
    const Owned<X509, X509_free> certificate(
        PEM_read_bio_X509(certificateBio.get(), nullptr, noPassphrase, nullptr));
    const Owned<EVP_PKEY, EVP_PKEY_free> key(
        PEM_read_bio_PrivateKey(keyBio.get(), nullptr, noPassphrase, nullptr));
    const bool fits = certificate && key && X509_check_private_key(certificate.get(), key.get()) == 1;
    ERR_clear_error();
    return fits;
}
