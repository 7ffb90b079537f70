// SPDX-License-Identifier: Apache-2.0
#include "fileaccess.h"

#include <QFile>

#include <cerrno>

#include <fcntl.h>
#include <grp.h>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

constexpr mode_t kPermissions = 07777;

QString userName(uid_t id)
{
    const passwd *entry = ::getpwuid(id);
    return entry != nullptr ? QString::fromLocal8Bit(entry->pw_name) : QString::number(id);
}

QString groupName(gid_t id)
{
    const group *entry = ::getgrgid(id);
    return entry != nullptr ? QString::fromLocal8Bit(entry->gr_name) : QString::number(id);
}

} // namespace

FileAccess FileAccess::of(const QString &path)
{
    const QByteArray name = QFile::encodeName(path);
    FileAccess access;
    struct stat info = {};
    if (::lstat(name.constData(), &info) != 0) {
        access.presence = errno == ENOENT || errno == ENOTDIR ? Presence::Absent : Presence::Unreadable;
        return access;
    }
    // A link is for whoever reads it to refuse.
    const bool isDenied =
        !S_ISLNK(info.st_mode) && ::faccessat(AT_FDCWD, name.constData(), R_OK, AT_EACCESS) != 0;
    access.presence = isDenied ? Presence::Unreadable : Presence::Readable;
    access.isDirectory = S_ISDIR(info.st_mode);
    access.ownerId = info.st_uid;
    access.mode = info.st_mode & kPermissions;
    access.owner = userName(info.st_uid);
    access.group = groupName(info.st_gid);
    return access;
}

QJsonObject FileAccess::toJson(const QString &path) const
{
    QJsonObject object{{QStringLiteral("path"), path}};
    if (!owner.isEmpty()) {
        object.insert(QStringLiteral("owner"), owner);
        object.insert(QStringLiteral("group"), group);
        object.insert(QStringLiteral("mode"), modeText());
    }
    return object;
}

QString FileAccess::toText(const QString &path) const
{
    return owner.isEmpty() ? path : QStringLiteral("%1 (%2:%3 %4)").arg(path, owner, group, modeText());
}
