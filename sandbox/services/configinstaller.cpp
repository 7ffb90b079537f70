// SPDX-License-Identifier: Apache-2.0
#include "configinstaller.h"

#include "journal/error.h"

#include "certificate.h"
#include "stagedfile.h"

#include <QDir>
#include <QJsonDocument>

namespace sandbox {

namespace {

constexpr char kStagingDirectory[] = "/tmp/vesk";

bool isRecord(const QByteArray &content)
{
    return QJsonDocument::fromJson(content).object().value(QLatin1String("is_Domain")).isBool();
}

bool isCertificate(const QByteArray &content)
{
    return !certificateDer(content).isEmpty();
}

bool isKey(const QByteArray &content)
{
    return content.contains("PRIVATE KEY-----");
}

// Where a file is staged, where it belongs, and how one sees that it is one.
struct Piece
{
    const char *staged;    // name in /tmp/vesk
    const char *installed; // absolute path
    FileAccess access;
    bool (*isOne)(const QByteArray &content);
    const char *objection; // to one that is none
};

constexpr Piece kCa = {"clientapi_ca.crt", "/etc/vesk/clientapi_ca.crt", FileAccess::Everyone, isCertificate,
                       "holds no certificate"};
constexpr Piece kCertificate = {"client.crt", "/etc/vesk/MOS_Vesk.pem", FileAccess::Everyone, isCertificate,
                                "holds no certificate"};
constexpr Piece kKey = {"client.key", "/etc/vesk/.MOS_Vesk.key", FileAccess::OwnerOnly, isKey,
                        "holds no private key"};
constexpr Piece kRecord = {"userinfo.json", "/etc/vesk/userinfo.json", FileAccess::Everyone, isRecord,
                           "is no terminal record"};

void note(const StateDirectory &state, const char *what, const Piece &piece, const QString &reason = {})
{
    const QString line = QLatin1String(what) + QLatin1Char(' ') + QLatin1String(piece.installed);
    state.journal().write(QStringLiteral("file"),
                          reason.isEmpty() ? line : line + QStringLiteral(": ") + reason);
}

std::optional<QByteArray> staged(const StateDirectory &state, const Piece &piece)
{
    StagedFile file =
        StagedFile::read(state.inside(QLatin1String(kStagingDirectory)), QLatin1String(piece.staged));
    if (file.refusal.isEmpty() && !piece.isOne(file.content))
        file.refusal = QLatin1String(piece.objection);
    if (file.refusal.isEmpty())
        return file.content;
    note(state, "refused", piece,
         QStringLiteral("%1/%2 %3")
             .arg(QLatin1String(kStagingDirectory), QLatin1String(piece.staged), file.refusal));
    return std::nullopt;
}

bool put(const StateDirectory &state, const Piece &piece, const QByteArray &content)
{
    QString error;
    const bool good = attempt(&error, [&] {
        smallfile::save(state.inside(QLatin1String(piece.installed)), content, piece.access);
    });
    note(state, good ? "installed" : "refused", piece, error);
    return good;
}

bool removeInstalled(const StateDirectory &state, const Piece &piece)
{
    QFile file(state.inside(QLatin1String(piece.installed)));
    if (!file.exists())
        return true;
    const bool gone = file.remove();
    note(state, gone ? "removed" : "refused to remove", piece, gone ? QString() : file.errorString());
    return gone;
}

} // namespace

bool ConfigInstaller::prepare() const
{
    return QDir().mkpath(m_state.inside(QStringLiteral("/etc/vesk")));
}

bool ConfigInstaller::install() const
{
    const bool prepared = prepare();
    const auto ca = staged(m_state, kCa);
    const auto certificate = staged(m_state, kCertificate);
    const auto key = staged(m_state, kKey);
    const auto record = staged(m_state, kRecord);
    if (!prepared || !ca || !certificate || !key || !record)
        return false;
    if (!keyFits(*certificate, *key)) {
        note(m_state, "refused", kKey, QStringLiteral("the key belongs to another certificate"));
        return false;
    }
    return put(m_state, kCa, *ca) && put(m_state, kCertificate, *certificate) && put(m_state, kKey, *key) &&
           put(m_state, kRecord, *record);
}

bool ConfigInstaller::remove() const
{
    const auto record = staged(m_state, kRecord);
    if (!record || !put(m_state, kRecord, *record))
        return false;
    bool good = true;
    for (const Piece &piece : {kKey, kCertificate, kCa})
        good = removeInstalled(m_state, piece) && good;
    return good;
}

} // namespace sandbox
