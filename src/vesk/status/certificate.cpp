// SPDX-License-Identifier: Apache-2.0
#include "certificate.h"

#include "owned.h"
#include "pemcheck.h"

#include <QCryptographicHash>

#include <openssl/err.h>
#include <openssl/pem.h>
#include <openssl/x509.h>

#include <cmath>
#include <ctime>

namespace {

constexpr double kSecondsOfDay = 24 * 60 * 60;

QString nameText(const X509_NAME *name)
{
    const Owned<BIO, BIO_free_all> text(BIO_new(BIO_s_mem()));
    X509_NAME_print_ex(text.get(), name, 0, XN_FLAG_RFC2253 & ~ASN1_STRFLGS_ESC_MSB);
    char *bytes = nullptr;
    const long size = BIO_get_mem_data(text.get(), &bytes);
    return QString::fromUtf8(bytes, static_cast<int>(size));
}

QString fingerprintOf(X509 *certificate)
{
    unsigned char *der = nullptr;
    const int size = i2d_X509(certificate, &der);
    const QByteArray bytes(reinterpret_cast<const char *>(der), qMax(size, 0));
    OPENSSL_free(der);
    const QByteArray digest = QCryptographicHash::hash(bytes, QCryptographicHash::Sha256);
    return QString::fromLatin1(digest.toHex(':')).toUpper();
}

QDateTime timeOf(const ASN1_TIME *time)
{
    std::tm parts = {};
    if (ASN1_TIME_to_tm(time, &parts) != 1)
        return {};
    return QDateTime::fromSecsSinceEpoch(::timegm(&parts), Qt::UTC);
}

} // namespace

std::optional<Certificate> Certificate::read(const QByteArray &pem)
{
    const Owned<BIO, BIO_free_all> bio(BIO_new_mem_buf(pem.constData(), pem.size()));
    const Owned<X509, X509_free> certificate(PEM_read_bio_X509(bio.get(), nullptr, noPassphrase, nullptr));
    ERR_clear_error();
    if (!certificate)
        return std::nullopt;
    return Certificate{nameText(X509_get_subject_name(certificate.get())),
                       nameText(X509_get_issuer_name(certificate.get())), fingerprintOf(certificate.get()),
                       timeOf(X509_get0_notBefore(certificate.get())),
                       timeOf(X509_get0_notAfter(certificate.get()))};
}

qint64 Certificate::daysLeft() const
{
    const auto seconds = static_cast<double>(QDateTime::currentDateTimeUtc().secsTo(to));
    return static_cast<qint64>(std::floor(seconds / kSecondsOfDay));
}

void Certificate::describeTo(QJsonObject &object) const
{
    object.insert(QStringLiteral("subject"), subject);
    object.insert(QStringLiteral("issuer"), issuer);
    object.insert(QStringLiteral("sha256"), fingerprint);
    object.insert(QStringLiteral("not_before"), from.toString(Qt::ISODate));
    object.insert(QStringLiteral("not_after"), to.toString(Qt::ISODate));
    object.insert(QStringLiteral("days_left"), daysLeft());
}
