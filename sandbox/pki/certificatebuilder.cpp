// SPDX-License-Identifier: Apache-2.0
#include "certificatebuilder.h"

#include <openssl/ec.h>
#include <openssl/err.h>
#include <openssl/x509v3.h>

namespace sandbox {

namespace {

constexpr int kSerialBits = 127; // at most 16 bytes in DER, and positive

bool setSerial(X509 *certificate)
{
    const BignumPointer number(BN_new());
    return number && BN_rand(number.get(), kSerialBits, BN_RAND_TOP_ONE, BN_RAND_BOTTOM_ANY) == 1 &&
           BN_to_ASN1_INTEGER(number.get(), X509_get_serialNumber(certificate)) != nullptr;
}

bool setValidity(X509 *certificate, const Validity &validity)
{
    const auto set = [](ASN1_TIME *field, const QDateTime &time) {
        return ASN1_TIME_adj(field, static_cast<time_t>(time.toSecsSinceEpoch()), 0, 0) != nullptr;
    };
    return set(X509_getm_notBefore(certificate), validity.from) &&
           set(X509_getm_notAfter(certificate), validity.to);
}

bool setSubject(X509 *certificate, const QString &commonName)
{
    const QByteArray name = commonName.toUtf8();
    return X509_NAME_add_entry_by_NID(X509_get_subject_name(certificate), NID_commonName, MBSTRING_UTF8,
                                      reinterpret_cast<const unsigned char *>(name.constData()), name.size(),
                                      -1, 0) == 1;
}

bool addExtension(X509 *certificate, X509 *issuer, int nid, const char *value)
{
    X509V3_CTX context;
    X509V3_set_ctx(&context, issuer, certificate, nullptr, nullptr, 0);
    X509_EXTENSION *extension = X509V3_EXT_conf_nid(nullptr, &context, nid, value);
    const bool ok = extension != nullptr && X509_add_ext(certificate, extension, -1) == 1;
    X509_EXTENSION_free(extension);
    return ok;
}

// Built as objects: in OpenSSL's text form a comma in a name would start another one.
GENERAL_NAME *alternativeName(const QString &name)
{
    GENERAL_NAME *entry = GENERAL_NAME_new();
    const QByteArray text = name.toUtf8();
    if (ASN1_OCTET_STRING *address = a2i_IPADDRESS(text.constData())) {
        GENERAL_NAME_set0_value(entry, GEN_IPADD, address);
        return entry;
    }
    ERR_clear_error(); // a name that is no address is none
    ASN1_IA5STRING *host = ASN1_IA5STRING_new();
    ASN1_STRING_set(host, text.constData(), text.size());
    GENERAL_NAME_set0_value(entry, GEN_DNS, host);
    return entry;
}

bool addAlternativeNames(X509 *certificate, const QStringList &names)
{
    if (names.isEmpty())
        return true;
    GENERAL_NAMES *entries = GENERAL_NAMES_new();
    for (const QString &name : names)
        sk_GENERAL_NAME_push(entries, alternativeName(name));
    const int added = X509_add1_ext_i2d(certificate, NID_subject_alt_name, entries, 0, X509V3_ADD_DEFAULT);
    GENERAL_NAMES_free(entries);
    return added == 1;
}

bool addPurpose(X509 *certificate, X509 *issuer, Purpose purpose)
{
    if (purpose == Purpose::Authority)
        return addExtension(certificate, issuer, NID_basic_constraints, "critical,CA:TRUE") &&
               addExtension(certificate, issuer, NID_key_usage, "critical,keyCertSign,cRLSign");
    const char *usage = purpose == Purpose::Server ? "serverAuth" : "clientAuth";
    return addExtension(certificate, issuer, NID_basic_constraints, "critical,CA:FALSE") &&
           addExtension(certificate, issuer, NID_key_usage, "critical,digitalSignature") &&
           addExtension(certificate, issuer, NID_ext_key_usage, usage);
}

bool fill(X509 *certificate, X509 *issuer, EVP_PKEY *key, const CertificateRequest &request)
{
    return X509_set_version(certificate, X509_VERSION_3) == 1 && setSerial(certificate) &&
           setValidity(certificate, request.validity) && setSubject(certificate, request.commonName) &&
           X509_set_pubkey(certificate, key) == 1 &&
           X509_set_issuer_name(certificate, X509_get_subject_name(issuer)) == 1 &&
           addExtension(certificate, issuer, NID_subject_key_identifier, "hash") &&
           addExtension(certificate, issuer, NID_authority_key_identifier, "keyid") &&
           addPurpose(certificate, issuer, request.purpose) &&
           addAlternativeNames(certificate, request.alternativeNames);
}

} // namespace

std::optional<KeyPair> buildCertificate(const CertificateRequest &request, const KeyPair *issuer,
                                        QString *error)
{
    const KeyPointer key(EVP_EC_gen("P-256"));
    const CertificatePointer certificate(X509_new());
    const CertificatePointer issuerCertificate(issuer ? readCertificate(issuer->certificatePem) : nullptr);
    const KeyPointer issuerKey(issuer ? readKey(issuer->keyPem) : nullptr);
    X509 *signer = issuer ? issuerCertificate.get() : certificate.get();
    EVP_PKEY *signingKey = issuer ? issuerKey.get() : key.get();

    if (key && certificate && signer != nullptr && signingKey != nullptr &&
        fill(certificate.get(), signer, key.get(), request) &&
        X509_sign(certificate.get(), signingKey, EVP_sha256()) > 0)
        return KeyPair{toPem(certificate.get()), toPem(key.get())};
    if (error != nullptr)
        *error = opensslError(QStringLiteral("certificate for \"%1\" not made").arg(request.commonName));
    return std::nullopt;
}

} // namespace sandbox
