// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"

#include "data/data.h"
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
std::optional<KeyPair> issue(const QString &kind, const QStringList &names, const Validity &validity,
                             const KeyPair *issuer, QString *error)
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
    QString reason;
    if (smallfile::write(at("openssl.cnf"), data::read("openssl.cnf"), FileAccess::OwnerOnly, &reason) &&
        (!issuer || issuer->save(at("ca.crt"), at("ca.key"), &reason))) {
        shell.start(QStringLiteral("sh"), {QStringLiteral("-c"), QLatin1String(kCommands)});
        shell.waitForFinished();
        reason = QString::fromUtf8(shell.readAllStandardError()).simplified();
    }
    const auto certificate = smallfile::read(at("certificate"));
    const auto key = smallfile::read(at("key"));
    if (shell.exitCode() == 0 && certificate && key)
        return KeyPair{*certificate, *key};
    if (error != nullptr)
        *error = QStringLiteral("certificate for \"%1\" cannot be created: %2").arg(names.value(0), reason);
    return std::nullopt;
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

std::optional<CertificateAuthority> CertificateAuthority::create(const QString &commonName, QString *error,
                                                                 const Validity &validity)
{
    auto pair = issue(QStringLiteral("authority"), {commonName}, validity, nullptr, error);
    if (!pair)
        return std::nullopt;
    return CertificateAuthority(std::move(*pair));
}

std::optional<CertificateAuthority> CertificateAuthority::load(const QString &certificatePath,
                                                               const QString &keyPath, QString *error)
{
    const auto certificate = smallfile::read(certificatePath, error);
    const auto key = certificate ? smallfile::read(keyPath, error) : std::nullopt;
    if (!key)
        return std::nullopt;
    QString reason;
    if (!isAuthority(*certificate))
        reason = certificatePath + QStringLiteral(": not the certificate of an authority");
    else if (!keyFits(*certificate, *key))
        reason = keyPath + QStringLiteral(": not the private key of ") + certificatePath;
    if (reason.isEmpty())
        return CertificateAuthority({*certificate, *key});
    if (error != nullptr)
        *error = reason;
    return std::nullopt;
}

bool CertificateAuthority::save(const QString &certificatePath, const QString &keyPath, QString *error) const
{
    return m_pair.save(certificatePath, keyPath, error);
}

std::optional<KeyPair> CertificateAuthority::issueServer(const QStringList &names, QString *error,
                                                         const Validity &validity) const
{
    return issue(QStringLiteral("server"), names, validity, &m_pair, error);
}

std::optional<KeyPair> CertificateAuthority::issueClient(const QString &commonName, QString *error,
                                                         const Validity &validity) const
{
    return issue(QStringLiteral("client"), {commonName}, validity, &m_pair, error);
}

std::optional<KeyPair> CertificateAuthority::selfSigned(const QStringList &names, QString *error,
                                                        const Validity &validity)
{
    return issue(QStringLiteral("server"), names, validity, nullptr, error);
}

} // namespace sandbox
