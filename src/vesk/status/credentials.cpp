// SPDX-License-Identifier: Apache-2.0
// CA, certificate and key: the files as the transport judges them, and the certificates in them.
#include "collectors.h"

#include "certificate.h"
#include "fileaccess.h"
#include "pemcheck.h"
#include "regularfile.h"
#include "sslconfiguration.h"
#include "wellknownpaths.h"

#include <QFile>

#include <unistd.h>

namespace regularfile = vesk::base::regularfile;

namespace {

constexpr int kWarnDays = 30;

struct CredentialFile
{
    QString key; // of its finding
    QString path;
    PemFile::Content content;
    bool isOfPair; // not of a terminal that has not joined
};

QVector<CredentialFile> credentialFiles()
{
    return {
        {QStringLiteral("ca"), QString::fromUtf8(vesk::kServerCertPath), PemFile::Content::Public, false},
        {QStringLiteral("certificate"), QString::fromUtf8(vesk::kPublicKeyPath), PemFile::Content::Public,
         true},
        {QStringLiteral("key"), QString::fromUtf8(vesk::kPrivateKeyPath), PemFile::Content::Secret, true}};
}

// The transport's words about a file, without the path with which they begin.
QString translated(const QString &reason, const QString &path)
{
    static const char *const known[] = {
        QT_TRANSLATE_NOOP("Text", "is not a regular file"),
        QT_TRANSLATE_NOOP("Text", "belongs to another user"),
        QT_TRANSLATE_NOOP("Text", "can be written by others"),
        QT_TRANSLATE_NOOP("Text", "is too long"),
        QT_TRANSLATE_NOOP("Text", "is empty"),
        QT_TRANSLATE_NOOP("Text", "is a symbolic link"),
    };
    const QString words = reason.mid(path.size() + 1);
    for (const char *text : known) {
        if (words == QLatin1String(text))
            return Text::tr(text);
    }
    return words;
}

// Whether or not the transport takes the file: who asks when a certificate expires need not be its user.
std::optional<Certificate> certificateIn(const CredentialFile &file)
{
    QFile content(file.path);
    if (file.content == PemFile::Content::Secret || !FileAccess::of(file.path).isReadable() ||
        !regularfile::openToRead(content, QIODevice::ReadOnly))
        return std::nullopt;
    return Certificate::read(regularfile::readAll(content));
}

Finding absent(const CredentialFile &file, Joined joined)
{
    Finding finding{file.key,
                    State::None,
                    FileAccess().toJson(file.path),
                    Text::tr("%1 is not there").arg(file.path),
                    {}};
    if (joined.value_or(false)) {
        finding.state = State::Fault;
        finding.advice = Text::tr("restore the file, or remove the terminal on the server and join again");
    }
    return finding;
}

// Root is told the same of a file that is a user's own as any other user; but the program is not root's.
bool isForItsOwnerToTell(const FileAccess &access)
{
    return ::geteuid() == 0 && access.ownerId != 0;
}

void judgeCertificate(const CredentialFile &file, const PemFile &read, Finding &finding)
{
    if (!holdsCertificates(read.contents)) {
        finding.state = State::Fault;
        finding.text = Text::tr("%1 holds no certificate, or a damaged one").arg(file.path);
        finding.advice = Text::tr("restore the file");
        return;
    }
    const std::optional<Certificate> certificate = certificateIn(file);
    if (!certificate)
        return;
    const qint64 days = certificate->daysLeft();
    finding.text += Text::tr(": %1, issued by %2, SHA-256 %3, expires in %4 days")
                        .arg(certificate->subject, certificate->issuer, certificate->fingerprint)
                        .arg(days);
    const bool isEarly = QDateTime::currentDateTimeUtc() < certificate->from;
    if (days < 0 || isEarly) {
        finding.state = State::Fault;
        finding.text =
            (isEarly
                 ? Text::tr("%1 is not valid yet: it begins on %2")
                       .arg(file.path, certificate->from.toString(Qt::ISODate))
                 : Text::tr("%1 has expired: on %2").arg(file.path, certificate->to.toString(Qt::ISODate)));
        finding.advice = Text::tr("check the clock; have the certificate renewed");
    } else if (days < kWarnDays) {
        finding.advice = Text::tr("have the certificate renewed before it expires");
    }
}

void judge(const CredentialFile &file, const FileAccess &access, Finding &finding)
{
    const PemFile read = PemFile::read(file.path, file.content);
    if (read.state == PemFile::State::Read) {
        if (!read.advice.isEmpty()) {
            finding.text += Text::tr(": others can read this key");
            finding.advice = Text::tr("owner root, a group of those who may leave, mode 0640");
        }
        if (file.content == PemFile::Content::Public)
            judgeCertificate(file, read, finding);
        return;
    }
    finding.state = isForItsOwnerToTell(access) ? State::Unknown : State::Fault;
    finding.text = QStringLiteral("%1 %2").arg(file.path, translated(read.reason, file.path));
    finding.advice =
        isForItsOwnerToTell(access)
            ? Text::tr("run this program as %1, whose file it is").arg(access.owner)
            : Text::tr("have it installed again: a regular file of root's, mode 0644, a key 0640");
}

QJsonObject describe(const CredentialFile &file, const FileAccess &access)
{
    QJsonObject value = access.toJson(file.path);
    if (const std::optional<Certificate> certificate = certificateIn(file)) {
        const QJsonObject details = certificate->toJson();
        for (auto detail = details.begin(); detail != details.end(); ++detail)
            value.insert(detail.key(), detail.value());
    }
    return value;
}

Finding fileFinding(const CredentialFile &file, Joined joined)
{
    const FileAccess access = FileAccess::of(file.path);
    if (access.isAbsent())
        return absent(file, joined);
    Finding finding{file.key, State::Ok, describe(file, access), access.toText(file.path), {}};
    if (!access.isReadable()) {
        finding.state = State::Unknown;
        finding.text = Text::tr("this user may not read %1").arg(access.toText(file.path));
        finding.advice = Text::tr("run this program as root, or as a user who may leave the domain");
        return finding;
    }
    judge(file, access, finding);
    if (finding.state == State::Ok && file.isOfPair && joined == Joined(false)) {
        finding.state = State::Fault;
        finding.text += Text::tr(": left over, this terminal has not joined");
        finding.advice = Text::tr("remove it, or restore the record");
    }
    return finding;
}

// What the program's requests would be, for this user.
Finding transportFinding(Joined joined, bool isAnyUnknown)
{
    const QString key = QStringLiteral("transport");
    if (isAnyUnknown)
        return {key,
                State::Unknown,
                QJsonValue::Null,
                Text::tr("cannot tell whether requests would be made: a file cannot be read"),
                {}};
    SslConfiguration configuration(QString::fromUtf8(vesk::kServerCertPath),
                                   QString::fromUtf8(vesk::kPublicKeyPath),
                                   QString::fromUtf8(vesk::kPrivateKeyPath));
    const SslConfiguration::Resolved &resolved = configuration.resolved();
    const bool hasPair = !resolved.credentials.certificate.isEmpty();
    const bool needsPair = joined.value_or(false);
    switch (resolved.trust) {
    case SslConfiguration::Trust::FirstContact:
        return {key, needsPair ? State::Fault : State::None, QStringLiteral("first-contact"),
                Text::tr("no CA here: the first server that is asked is trusted"),
                needsPair ? Text::tr("restore CA, certificate and key") : QString()};
    case SslConfiguration::Trust::Refused:
        return {key, State::Fault, QStringLiteral("refused"),
                Text::tr("every request is refused: %1").arg(resolved.reason),
                Text::tr("see the files above: all three or, before a join, at most the CA")};
    case SslConfiguration::Trust::Verified:
        break;
    }
    return {key,
            needsPair && !hasPair ? State::Fault : State::Ok,
            QStringLiteral("verified"),
            hasPair ? Text::tr("requests are verified and made with the client certificate")
                    : Text::tr("requests are verified under the CA, without client certificate"),
            {}};
}

Finding pairFinding(bool isAnyUnknown)
{
    const QString key = QStringLiteral("pair");
    const PemFile certificate =
        PemFile::read(QString::fromUtf8(vesk::kPublicKeyPath), PemFile::Content::Public);
    const PemFile secret = PemFile::read(QString::fromUtf8(vesk::kPrivateKeyPath), PemFile::Content::Secret);
    if (certificate.isAbsent() || secret.isAbsent())
        return {key, State::None, QJsonValue::Null, Text::tr("no certificate with a key"), {}};
    if (isAnyUnknown || certificate.state != PemFile::State::Read || secret.state != PemFile::State::Read)
        return {key,
                State::Unknown,
                QJsonValue::Null,
                Text::tr("cannot tell whether the key belongs to the certificate"),
                {}};
    if (!isPair(certificate.contents, secret.contents))
        return {key, State::Fault, false, Text::tr("damaged, or the key does not belong to the certificate"),
                Text::tr("restore the pair: both files of the same join")};
    return {key, State::Ok, true, Text::tr("the key belongs to the certificate"), {}};
}

} // namespace

Findings credentialFindings(Joined joined)
{
    Findings findings;
    bool isAnyUnknown = false;
    for (const CredentialFile &file : credentialFiles()) {
        findings += fileFinding(file, joined);
        isAnyUnknown = isAnyUnknown || findings.constLast().state == State::Unknown;
    }
    findings += pairFinding(isAnyUnknown);
    findings += transportFinding(joined, isAnyUnknown);
    return findings;
}

Findings expiringCredentials(int days)
{
    Findings findings;
    for (const CredentialFile &file : credentialFiles()) {
        const FileAccess access = FileAccess::of(file.path);
        const std::optional<Certificate> certificate = certificateIn(file);
        if (certificate && certificate->daysLeft() < days)
            findings += Finding{file.key,
                                State::Fault,
                                certificate->daysLeft(),
                                Text::tr("%1 expires on %2, in %3 days: %4")
                                    .arg(file.path, certificate->to.toString(Qt::ISODate))
                                    .arg(certificate->daysLeft())
                                    .arg(certificate->subject),
                                {}};
        else if (!certificate && file.content == PemFile::Content::Public && !access.isAbsent())
            findings += Finding{file.key,
                                State::Unknown,
                                QJsonValue::Null,
                                Text::tr("cannot tell when %1 expires").arg(file.path),
                                {}};
    }
    return findings;
}
