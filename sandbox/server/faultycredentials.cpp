// SPDX-License-Identifier: Apache-2.0
#include "server/faultycredentials.h"

namespace sandbox {

namespace {

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

std::optional<KeyPair> faultyCredentials(ConnectionFault fault, const CertificateAuthority &authority,
                                         const QStringList &names, QString *error)
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
