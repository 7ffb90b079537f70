// SPDX-License-Identifier: Apache-2.0
#include "server/pkifolder.h"

#include <QDir>
#include <QFile>

#include <openssl/pem.h>
#include <openssl/x509v3.h>

#include <algorithm>
#include <memory>

namespace sandbox {

namespace {

std::optional<QByteArray> contentsOf(const QString &path, QString *error)
{
    QFile file(path);
    if (file.open(QIODevice::ReadOnly))
        return file.readAll();
    *error = QStringLiteral("%1: cannot be read: %2").arg(path, file.errorString());
    return std::nullopt;
}

bool covers(X509 *certificate, const QString &name)
{
    const QByteArray text = name.toLatin1();
    return X509_check_host(certificate, text.constData(), 0, 0, nullptr) == 1 ||
           X509_check_ip_asc(certificate, text.constData(), 0) == 1;
}

// Whether a server can still show this certificate under all of these names.
bool serves(const QByteArray &certificatePem, const QStringList &names)
{
    const std::unique_ptr<BIO, decltype(&BIO_free_all)> memory(
        BIO_new_mem_buf(certificatePem.constData(), static_cast<int>(certificatePem.size())), &BIO_free_all);
    const std::unique_ptr<X509, decltype(&X509_free)> certificate(
        PEM_read_bio_X509(memory.get(), nullptr, nullptr, nullptr), &X509_free);
    return certificate && X509_cmp_current_time(X509_get0_notAfter(certificate.get())) > 0 &&
           std::all_of(names.begin(), names.end(),
                       [&](const QString &name) { return covers(certificate.get(), name); });
}

std::optional<CertificateAuthority> authorityIn(const QDir &folder, QString *error)
{
    const QString certificate = folder.filePath(QStringLiteral("ca.crt"));
    const QString key = folder.filePath(QStringLiteral("ca.key"));
    if (QFile::exists(certificate) || QFile::exists(key))
        return CertificateAuthority::load(certificate, key, error);
    auto authority = CertificateAuthority::create(QStringLiteral("Enrolment sandbox CA"), error);
    if (authority && !authority->save(certificate, key, error))
        return std::nullopt;
    return authority;
}

std::optional<KeyPair> madeServerPair(const CertificateAuthority &authority, const QString &path,
                                      const QStringList &names, QString *error)
{
    auto pair = authority.issueServer(names, error);
    const bool saved =
        pair && writePemFile(path + QLatin1String(".key"), pair->keyPem, FileAccess::OwnerOnly, error) &&
        writePemFile(path + QLatin1String(".crt"), pair->certificatePem, FileAccess::Everyone, error);
    return saved ? pair : std::nullopt;
}

std::optional<KeyPair> serverPairIn(const QDir &folder, const QString &name,
                                    const CertificateAuthority &authority, const QStringList &names,
                                    QString *error)
{
    const QString path = folder.filePath(name);
    if (!QFile::exists(path + QLatin1String(".crt")))
        return madeServerPair(authority, path, names, error);
    const auto certificate = contentsOf(path + QLatin1String(".crt"), error);
    if (!certificate)
        return std::nullopt;
    if (!certificateDer(*certificate).isEmpty() && !serves(*certificate, names))
        return madeServerPair(authority, path, names, error);
    const auto key = contentsOf(path + QLatin1String(".key"), error);
    if (!key)
        return std::nullopt;
    if (keyFits(*certificate, *key))
        return KeyPair{*certificate, *key};
    *error = QStringLiteral("%1.crt: is damaged or does not fit %1.key").arg(path);
    return std::nullopt;
}

} // namespace

std::optional<PkiFolder> PkiFolder::open(const QString &path, const QStringList &serverNames, QString *error)
{
    const QDir folder(path);
    auto authority = authorityIn(folder, error);
    if (!authority)
        return std::nullopt;
    auto enrolment = serverPairIn(folder, QStringLiteral("enrolment"), *authority, serverNames, error);
    if (!enrolment)
        return std::nullopt;
    auto managed = serverPairIn(folder, QStringLiteral("managed"), *authority, serverNames, error);
    if (!managed)
        return std::nullopt;
    return PkiFolder{std::move(*authority), std::move(*enrolment), std::move(*managed)};
}

} // namespace sandbox
