// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"

#include "data/data.h"
#include "journal/error.h"
#include "process.h"

#include <QHostAddress>
#include <QSslCertificate>
#include <QSslCertificateExtension>
#include <QTemporaryDir>

#include <algorithm>

namespace sandbox {

namespace {

QString alternativeNames(const QStringList &names)
{
    QStringList texts;
    for (const QString &name : names)
        texts += (QHostAddress(name).isNull() ? QStringLiteral("DNS:") : QStringLiteral("IP:")) + name;
    return texts.join(QLatin1Char(','));
}

QString timeText(const QDateTime &time)
{
    return time.toUTC().toString(QStringLiteral("yyyyMMddhhmmss'Z'"));
}

// Key, request and certificate; in one process of ours, since it is the first fork that takes time.
constexpr char kCommands[] = R"(umask 077 && : >database &&
openssl req -config openssl.cnf -new -newkey ec -pkeyopt ec_paramgen_curve:P-256 -nodes -keyout key -out request &&
openssl ca -config openssl.cnf -name issue -extensions "$KIND" -startdate "$FROM" -enddate "$TO" $SIGNER \
    -batch -notext -in request -out certificate)";

// `kind` is the section of openssl.cnf that says what the certificate is for; the first name becomes its
// common name. Without an issuer it signs itself.
KeyPair issue(const QString &kind, const QStringList &names, const Validity &validity, const KeyPair *issuer)
{
    const QTemporaryDir directory; // its owner's only; openssl gives the new key mode 0600 besides
    const auto at = [&](const char *name) {
        return directory.filePath(QLatin1String(name));
    };
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    const auto set = [&](const char *name, const QString &value) {
        environment.insert(QLatin1String(name), value);
    };
    set("COMMON_NAME", names.value(0));
    set("ALTERNATIVE_NAMES", alternativeNames(names));
    set("KIND", kind);
    set("FROM", timeText(validity.from));
    set("TO", timeText(validity.to));
    set("SIGNER",
        issuer ? QStringLiteral("-cert ca.crt -keyfile ca.key") : QStringLiteral("-selfsign -keyfile key"));
    vesk::base::Process shell;
    shell.setWorkingDirectory(directory.path());
    shell.setProcessEnvironment(environment);
    smallfile::save(at("openssl.cnf"), data::read("openssl.cnf"), FileAccess::OwnerOnly);
    if (issuer)
        issuer->save(at("ca.crt"), at("ca.key"));
    shell.start(QStringLiteral("sh"), {QStringLiteral("-c"), QLatin1String(kCommands)});
    shell.waitForFinished();
    const auto certificate = smallfile::read(at("certificate"));
    const auto key = smallfile::read(at("key"));
    if (shell.exitCode() != 0 || !certificate || !key)
        throw Error(QStringLiteral("certificate for \"%1\" cannot be created: %2")
                        .arg(names.value(0), QString::fromUtf8(shell.readAllStandardError()).simplified()));
    return {*certificate, *key};
}

bool isAuthority(const QByteArray &certificatePem)
{
    const auto extensions = QSslCertificate(certificatePem).extensions();
    return std::any_of(extensions.begin(), extensions.end(), [](const QSslCertificateExtension &extension) {
        return extension.name() == QLatin1String("basicConstraints") &&
               extension.value().toMap().value(QStringLiteral("ca")).toBool();
    });
}

} // namespace

CertificateAuthority CertificateAuthority::create(const QString &commonName, const Validity &validity)
{
    return CertificateAuthority(issue(QStringLiteral("authority"), {commonName}, validity, nullptr));
}

CertificateAuthority CertificateAuthority::load(const QString &certificatePath, const QString &keyPath)
{
    const QByteArray certificate = smallfile::load(certificatePath);
    const QByteArray key = smallfile::load(keyPath);
    if (!isAuthority(certificate))
        throw Error(certificatePath + QStringLiteral(": not the certificate of an authority"));
    if (!keyFits(certificate, key))
        throw Error(keyPath + QStringLiteral(": not the private key of ") + certificatePath);
    return CertificateAuthority({certificate, key});
}

void CertificateAuthority::save(const QString &certificatePath, const QString &keyPath) const
{
    m_pair.save(certificatePath, keyPath);
}

KeyPair CertificateAuthority::issueServer(const QStringList &names, const Validity &validity) const
{
    return issue(QStringLiteral("server"), names, validity, &m_pair);
}

KeyPair CertificateAuthority::issueClient(const QString &commonName, const Validity &validity) const
{
    return issue(QStringLiteral("client"), {commonName}, validity, &m_pair);
}

KeyPair CertificateAuthority::selfSigned(const QStringList &names, const Validity &validity)
{
    return issue(QStringLiteral("server"), names, validity, nullptr);
}

} // namespace sandbox
