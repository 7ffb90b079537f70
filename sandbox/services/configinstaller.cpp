// SPDX-License-Identifier: Apache-2.0
#include "configinstaller.h"

#include "certificate.h"
#include "stagedfile.h"

#include <QDir>
#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>

namespace sandbox {

// Where a file is staged, where it belongs, and how one sees that it is one.
struct ConfigInstaller::Piece
{
    const char *staged;    // name in /tmp/vesk
    const char *installed; // absolute path
    FileAccess access;
    QString (*objection)(const QByteArray &content);
    QByteArray content;
};

namespace {

QString objectionToRecord(const QByteArray &content)
{
    const QJsonDocument document = QJsonDocument::fromJson(content);
    return document.object().value(QLatin1String("is_Domain")).isBool()
               ? QString()
               : QStringLiteral("is no terminal record");
}

QString objectionToCertificate(const QByteArray &content)
{
    return certificateDer(content).isEmpty() ? QStringLiteral("holds no certificate") : QString();
}

QString objectionToKey(const QByteArray &content)
{
    return content.contains("PRIVATE KEY-----") ? QString() : QStringLiteral("holds no private key");
}

constexpr char kFolder[] = "/etc/vesk";
constexpr char kStagingFolder[] = "/tmp/vesk";
constexpr char kRecord[] = "/etc/vesk/userinfo.json";
constexpr char kCa[] = "/etc/vesk/clientapi_ca.crt";
constexpr char kCertificate[] = "/etc/vesk/MOS_Vesk.pem";
constexpr char kKey[] = "/etc/vesk/.MOS_Vesk.key";

} // namespace

bool ConfigInstaller::prepare() const
{
    return QDir().mkpath(m_state.inside(QLatin1String(kFolder)));
}

bool ConfigInstaller::install() const
{
    Piece ca{"clientapi_ca.crt", kCa, FileAccess::Everyone, objectionToCertificate, {}};
    Piece certificate{"client.crt", kCertificate, FileAccess::Everyone, objectionToCertificate, {}};
    Piece key{"client.key", kKey, FileAccess::OwnerOnly, objectionToKey, {}};
    Piece record{"userinfo.json", kRecord, FileAccess::Everyone, objectionToRecord, {}};
    bool good = prepare();
    for (Piece *piece : {&ca, &certificate, &key, &record})
        good = stage(piece) && good;
    if (good && !keyFits(certificate.content, key.content)) {
        note(QStringLiteral("refused %1: the key belongs to another certificate").arg(QLatin1String(kKey)));
        good = false;
    }
    return good && put(ca) && put(certificate) && put(key) && put(record);
}

bool ConfigInstaller::remove() const
{
    Piece record{"userinfo.json", kRecord, FileAccess::Everyone, objectionToRecord, {}};
    if (!stage(&record) || !put(record))
        return false;
    bool good = true;
    for (const char *path : {kKey, kCertificate, kCa})
        good = takeAway(QLatin1String(path)) && good;
    return good;
}

bool ConfigInstaller::stage(Piece *piece) const
{
    const StagedFile staged =
        StagedFile::read(m_state.inside(QLatin1String(kStagingFolder)), QLatin1String(piece->staged));
    const QString refusal = staged.refusal.isEmpty() ? piece->objection(staged.content) : staged.refusal;
    piece->content = staged.content;
    if (!refusal.isEmpty())
        note(QStringLiteral("refused %1: %2/%3 %4")
                 .arg(QLatin1String(piece->installed), QLatin1String(kStagingFolder),
                      QLatin1String(piece->staged), refusal));
    return refusal.isEmpty();
}

bool ConfigInstaller::put(const Piece &piece) const
{
    const QString path = QLatin1String(piece.installed);
    QString error;
    if (!smallfile::write(m_state.inside(path), piece.content, piece.access, &error)) {
        note(QStringLiteral("refused %1: %2").arg(path, error));
        return false;
    }
    note(QStringLiteral("installed %1").arg(path));
    return true;
}

bool ConfigInstaller::takeAway(const QString &path) const
{
    QFile file(m_state.inside(path));
    if (!file.exists())
        return true;
    const bool gone = file.remove();
    note(gone ? QStringLiteral("removed %1").arg(path)
              : QStringLiteral("refused to remove %1: %2").arg(path, file.errorString()));
    return gone;
}

} // namespace sandbox
