// SPDX-License-Identifier: Apache-2.0
#include "server/pkidirectory.h"

#include <QDir>
#include <QSslCertificate>

#include <algorithm>

namespace sandbox {

namespace {

// Whether a server can still show this certificate under all of these names.
bool serves(const QSslCertificate &certificate, const QStringList &names)
{
    const QStringList covered = certificate.subjectAlternativeNames().values();
    return certificate.expiryDate() > QDateTime::currentDateTimeUtc() &&
           std::all_of(names.begin(), names.end(),
                       [&](const QString &name) { return covered.contains(name); });
}

std::optional<CertificateAuthority> authorityIn(const QDir &directory, QString *error)
{
    const QString certificate = directory.filePath(QStringLiteral("ca.crt"));
    const QString key = directory.filePath(QStringLiteral("ca.key"));
    if (QFile::exists(certificate) || QFile::exists(key))
        return CertificateAuthority::load(certificate, key, error);
    auto authority = CertificateAuthority::create(QStringLiteral("Enrolment sandbox CA"), error);
    return authority && authority->save(certificate, key, error) ? authority : std::nullopt;
}

std::optional<KeyPair> serverPairAt(const QString &path, const CertificateAuthority &authority,
                                    const QStringList &names, QString *error)
{
    const QString certificatePath = path + QLatin1String(".crt");
    const QString keyPath = path + QLatin1String(".key");
    const bool exists = QFile::exists(certificatePath);
    const auto certificate = exists ? smallfile::read(certificatePath, error) : QByteArray();
    if (!certificate)
        return std::nullopt;
    const QSslCertificate told(*certificate);
    if (!exists || (!told.isNull() && !serves(told, names))) {
        auto pair = authority.issueServer(names, error);
        return pair && pair->save(certificatePath, keyPath, error) ? pair : std::nullopt;
    }
    const auto key = smallfile::read(keyPath, error);
    if (!key || keyFits(*certificate, *key))
        return key ? std::optional<KeyPair>({*certificate, *key}) : std::nullopt;
    *error = QStringLiteral("%1.crt: is damaged or does not fit %1.key").arg(path);
    return std::nullopt;
}

std::optional<KeyPair> byOther(const QString &name, const QStringList &names, QString *error)
{
    const auto other = CertificateAuthority::create(name, error);
    return other ? other->issueServer(names, error) : std::nullopt;
}

Validity between(int fromDays, int toDays)
{
    const QDateTime now = QDateTime::currentDateTimeUtc();
    return {now.addDays(fromDays), now.addDays(toDays)};
}

} // namespace

std::optional<PkiDirectory> PkiDirectory::open(const QString &path, const QStringList &names, QString *error)
{
    const QDir directory(path);
    auto authority = authorityIn(directory, error);
    if (!authority)
        return std::nullopt;
    auto enrolment = serverPairAt(directory.filePath(QStringLiteral("enrolment")), *authority, names, error);
    auto managed = enrolment
                       ? serverPairAt(directory.filePath(QStringLiteral("managed")), *authority, names, error)
                       : std::nullopt;
    if (!managed)
        return std::nullopt;
    return PkiDirectory{std::move(*authority), std::move(*enrolment), std::move(*managed)};
}

std::optional<KeyPair> PkiDirectory::faulty(ConnectionFault fault, const QStringList &names,
                                            QString *error) const
{
    switch (fault) {
    case ConnectionFault::Expired:
        return authority.issueServer(names, error, between(-9, -1));
    case ConnectionFault::NotYetValid:
        return authority.issueServer(names, error, between(1, 9));
    case ConnectionFault::OtherHost:
        return authority.issueServer({QStringLiteral("elsewhere.test")}, error);
    case ConnectionFault::OtherCa:
        return byOther(QStringLiteral("Another CA"), names, error);
    case ConnectionFault::OtherCaOfThatName:
        return byOther(certificateCommonName(authority.certificatePem()), names, error);
    case ConnectionFault::SelfSigned:
        return CertificateAuthority::selfSigned(names, error);
    case ConnectionFault::ClientPurpose:
        return authority.issueClient(names.constFirst(), error);
    default:
        return KeyPair();
    }
}

} // namespace sandbox
