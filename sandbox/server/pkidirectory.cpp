// SPDX-License-Identifier: Apache-2.0
#include "server/pkidirectory.h"

#include "journal/error.h"

#include <QFile>
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

CertificateAuthority authorityIn(const QString &directory)
{
    const QString certificate = directory + QStringLiteral("/ca.crt");
    const QString key = directory + QStringLiteral("/ca.key");
    if (QFile::exists(certificate) || QFile::exists(key))
        return CertificateAuthority::load(certificate, key);
    auto authority = CertificateAuthority::create(QStringLiteral("Enrolment sandbox CA"));
    authority.save(certificate, key);
    return authority;
}

KeyPair serverPairAt(const QString &path, const CertificateAuthority &authority, const QStringList &names)
{
    const QString certificatePath = path + QLatin1String(".crt");
    const QString keyPath = path + QLatin1String(".key");
    KeyPair pair;
    const bool exists = QFile::exists(certificatePath);
    if (exists)
        pair.certificatePem = smallfile::load(certificatePath);
    const QSslCertificate told(pair.certificatePem);
    if (!exists || (!told.isNull() && !serves(told, names))) {
        pair = authority.issueServer(names);
        pair.save(certificatePath, keyPath);
        return pair;
    }
    pair.keyPem = smallfile::load(keyPath);
    if (!keyFits(pair.certificatePem, pair.keyPem))
        throw Error(QStringLiteral("%1.crt: is damaged or does not fit %1.key").arg(path));
    return pair;
}

Validity between(int fromDays, int toDays)
{
    const QDateTime now = QDateTime::currentDateTimeUtc();
    return {now.addDays(fromDays), now.addDays(toDays)};
}

} // namespace

PkiDirectory::PkiDirectory(const QString &directory, const QStringList &names)
    : authority(authorityIn(directory))
    , enrolment(serverPairAt(directory + QStringLiteral("/enrolment"), authority, names))
    , managed(serverPairAt(directory + QStringLiteral("/managed"), authority, names))
{
}

KeyPair PkiDirectory::faulty(ConnectionFault fault, const QStringList &names) const
{
    switch (fault) {
    case ConnectionFault::Expired:
        return authority.issueServer(names, between(-9, -1));
    case ConnectionFault::NotYetValid:
        return authority.issueServer(names, between(1, 9));
    case ConnectionFault::OtherHost:
        return authority.issueServer({QStringLiteral("elsewhere.test")});
    case ConnectionFault::OtherCa:
        return CertificateAuthority::create(QStringLiteral("Another CA")).issueServer(names);
    case ConnectionFault::OtherCaOfThatName:
        return CertificateAuthority::create(certificateCommonName(authority.certificatePem()))
            .issueServer(names);
    case ConnectionFault::SelfSigned:
        return CertificateAuthority::selfSigned(names);
    case ConnectionFault::ClientPurpose:
        return authority.issueClient(names.constFirst());
    default:
        return {};
    }
}

} // namespace sandbox
