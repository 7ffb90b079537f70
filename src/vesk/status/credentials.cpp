// SPDX-License-Identifier: Apache-2.0
// CA, certificate and key: the files as the transport judges them, and the certificates in them.
#include "collectors.h"

#include "certificate.h"
#include "fileaccess.h"
#include "pemcheck.h"
#include "pemfile.h"
#include "regularfile.h"
#include "transport.h"
#include "wellknownpaths.h"

#include <QFile>

#include <unistd.h>

namespace regularfile = vesk::base::regularfile;

namespace {

constexpr int kWarnDays = 30;

// One of the three files, and what can be said of it so far.
struct CredentialFile
{
    CredentialFile(const char *name, const char *location, PemFile::Content kind)
        : key(QLatin1String(name))
        , path(QString::fromUtf8(location))
        , content(kind)
        , access(FileAccess::of(path))
    {
        // Whether or not the transport takes the file: who asks when it expires need not be its user.
        QFile file(path);
        if (isPublic() && access.isReadable() && regularfile::open(file, QIODevice::ReadOnly) &&
            file.size() <= PemFile::kMaxSize)
            certificate = Certificate::read(file.read(PemFile::kMaxSize));
    }

    bool isPublic() const { return content == PemFile::Content::Public; }
    // To root as to anybody else a file of a user's is one of another user. But the program is not root's.
    bool isForItsOwnerToTell() const { return ::geteuid() == 0 && access.ownerId != 0; }

    QString key; // of its finding
    QString path;
    PemFile::Content content;
    FileAccess access;
    std::optional<Certificate> certificate;
};

QVector<CredentialFile> credentialFiles()
{
    return {{"ca", vesk::kServerCertPath, PemFile::Content::Public},
            {"certificate", vesk::kPublicKeyPath, PemFile::Content::Public},
            {"key", vesk::kPrivateKeyPath, PemFile::Content::Secret}};
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
    QString words = reason.mid(path.size() + 1);
    for (const char *text : known) {
        if (words == QLatin1String(text))
            return Text::tr(text);
    }
    return words;
}

void fail(Finding &finding, const QString &text, const QString &advice)
{
    finding.state = State::Fault;
    finding.text = text;
    finding.advice = advice;
}

void judgeCertificate(const CredentialFile &file, Finding &finding)
{
    const Certificate &certificate = *file.certificate;
    const QString renew = Text::tr("check the clock; have the certificate renewed");
    const qint64 days = certificate.daysLeft();
    finding.text +=
        Text::tr(": %1, issued by %2, SHA-256 %3, expires in %4 days")
            .arg(certificate.subject, certificate.issuer, certificate.fingerprint, QString::number(days));
    if (QDateTime::currentDateTimeUtc() < certificate.from)
        fail(finding,
             Text::tr("%1 is not valid yet: it begins on %2")
                 .arg(file.path, certificate.from.toString(Qt::ISODate)),
             renew);
    else if (days < 0)
        fail(finding, Text::tr("%1 has expired: on %2").arg(file.path, certificate.to.toString(Qt::ISODate)),
             renew);
    else if (days < kWarnDays)
        finding.advice = Text::tr("have the certificate renewed before it expires");
}

void judge(const CredentialFile &file, Finding &finding)
{
    const PemFile read = PemFile::read(file.path, file.content);
    if (read.state != PemFile::State::Read) {
        fail(finding, QStringLiteral("%1 %2").arg(file.path, translated(read.reason, file.path)),
             Text::tr("have it installed again: a regular file of root's, mode 0644, the key 0640"));
        if (file.isForItsOwnerToTell()) {
            finding.state = State::Unknown;
            finding.advice = Text::tr("run this program as %1, whose file it is").arg(file.access.owner);
        }
    } else if (file.isPublic() && (!file.certificate || !holdsCertificates(read.contents))) {
        fail(finding, Text::tr("%1 holds no certificate, or a damaged one").arg(file.path),
             Text::tr("restore the file"));
    } else if (file.isPublic()) {
        judgeCertificate(file, finding);
    } else if (!read.advice.isEmpty()) {
        finding.text += Text::tr(": others can read this key");
        finding.advice = Text::tr("owner root, a group of those who may leave, mode 0640");
    }
}

Finding fileFinding(const CredentialFile &file, Joined joined)
{
    QJsonObject value = file.access.toJson(file.path);
    if (file.certificate)
        file.certificate->describeTo(value);
    const QString absent = Text::tr("%1 is not there").arg(file.path);
    const QString restore = Text::tr("restore the file, or remove the terminal on the server and join again");
    if (file.access.isAbsent())
        return joined.value_or(false) ? Finding::fault(file.key, value, absent, restore)
                                      : Finding::none(file.key, value, absent);
    Finding finding = Finding::ok(file.key, value, file.access.toText(file.path));
    if (!file.access.isReadable()) {
        finding.state = State::Unknown;
        finding.text = Text::tr("this user may not read %1").arg(finding.text);
        finding.advice = Text::tr("run this program as root, or as a user who may leave the domain");
        return finding;
    }
    judge(file, finding);
    const bool isOfPair = file.path != QLatin1String(vesk::kServerCertPath);
    if (finding.state == State::Ok && isOfPair && joined == Joined(false))
        fail(finding, finding.text + Text::tr(": left over, this terminal has not joined"),
             Text::tr("remove it, or restore the record"));
    return finding;
}

Finding pairFinding()
{
    const QString key = QStringLiteral("pair");
    const PemFile certificate =
        PemFile::read(QString::fromUtf8(vesk::kPublicKeyPath), PemFile::Content::Public);
    const PemFile secret = PemFile::read(QString::fromUtf8(vesk::kPrivateKeyPath), PemFile::Content::Secret);
    if (certificate.isAbsent() || secret.isAbsent())
        return Finding::none(key, QJsonValue::Null, Text::tr("no certificate with a key"));
    if (certificate.state != PemFile::State::Read || secret.state != PemFile::State::Read)
        return Finding::unknown(key, Text::tr("cannot tell whether the key belongs to the certificate"));
    if (!isPair(certificate.contents, secret.contents))
        return Finding::fault(key, false, Text::tr("damaged, or the key does not belong to the certificate"),
                              Text::tr("restore the pair: both files of the same join"));
    return Finding::ok(key, true, Text::tr("the key belongs to the certificate"));
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
    findings += pairFinding();
    Credentials credentials;
    findings += isAnyUnknown ? Finding::unknown(QStringLiteral("transport"),
                                                Text::tr("cannot tell what becomes of a request"))
                             : transportFinding(joined.value_or(false), credentials);
    return findings;
}

Findings expiringCredentials(int days)
{
    Findings findings;
    for (const CredentialFile &file : credentialFiles()) {
        if (!file.isPublic() || file.access.isAbsent())
            continue;
        if (!file.certificate)
            findings += Finding::unknown(file.key, Text::tr("cannot tell when %1 expires").arg(file.path));
        else if (file.certificate->daysLeft() < days)
            findings += Finding::fault(file.key, file.certificate->daysLeft(),
                                       Text::tr("%1 expires on %2, in %3 days: %4")
                                           .arg(file.path, file.certificate->to.toString(Qt::ISODate),
                                                QString::number(file.certificate->daysLeft()),
                                                file.certificate->subject),
                                       {});
    }
    return findings;
}
