// SPDX-License-Identifier: Apache-2.0
#include "play/viewfiles.h"

#include "journal/smallfile.h"

#include <QCryptographicHash>
#include <QDirIterator>
#include <QFileInfo>

#include <sys/stat.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr qint64 kMaxHashed = 4LL * 1024 * 1024;
const QString kHome = QStringLiteral("~");

const char *typeOf(mode_t mode)
{
    if (S_ISDIR(mode))
        return "directory";
    if (S_ISREG(mode))
        return "file";
    if (S_ISFIFO(mode))
        return "FIFO";
    return S_ISSOCK(mode) ? "socket" : "device";
}

ViewEntry entryAt(const QString &path)
{
    struct stat info = {};
    if (::lstat(QFile::encodeName(path).constData(), &info) != 0)
        return {};
    if (S_ISLNK(info.st_mode))
        return {QStringLiteral("link to ") + QFileInfo(path).symLinkTarget(), {}};
    ViewEntry entry;
    entry.look = QStringLiteral("0%1 %2")
                     .arg(info.st_mode & 07777U, 3, 8, QLatin1Char('0'))
                     .arg(QLatin1String(typeOf(info.st_mode)));
    if (info.st_uid != ::getuid())
        entry.look += QStringLiteral(" of user %1").arg(info.st_uid);
    if (S_ISREG(info.st_mode))
        entry.content = QStringLiteral("%1 %2.%3 %4")
                            .arg(info.st_size)
                            .arg(info.st_mtim.tv_sec)
                            .arg(info.st_mtim.tv_nsec)
                            .arg(info.st_size <= kMaxHashed ? contentHash(path) : QString());
    return entry;
}

void add(ViewFiles *files, const QString &name, const QString &directory)
{
    QDirIterator entries(directory, QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot,
                         QDirIterator::Subdirectories);
    while (entries.hasNext()) {
        const QString path = entries.next();
        files->insert(name + path.mid(directory.size()), entryAt(path));
    }
}

} // namespace

QString contentHash(const QString &path)
{
    constexpr int kDigits = 16;
    QCryptographicHash hash(QCryptographicHash::Sha256);
    hash.addData(smallfile::read(path).value_or(QByteArray()));
    return QString::fromLatin1(hash.result().toHex().left(kDigits));
}

ViewFiles viewFiles(const StateDirectory &state)
{
    ViewFiles files;
    add(&files, QString(), state.root());
    add(&files, kHome, state.home());
    return files;
}

QString hostPath(const StateDirectory &state, const QString &path)
{
    return path.startsWith(kHome) ? state.home() + path.mid(kHome.size()) : state.inside(path);
}

void follow(const ViewFiles &earlier, const ViewFiles &later, ViewFiles *before)
{
    for (auto entry = later.begin(); entry != later.end(); ++entry) {
        if (earlier.value(entry.key()) != *entry)
            before->insert(entry.key(), *entry);
    }
    for (auto entry = earlier.begin(); entry != earlier.end(); ++entry) {
        if (!later.contains(entry.key()))
            before->remove(entry.key());
    }
}

} // namespace sandbox
