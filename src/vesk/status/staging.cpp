// SPDX-License-Identifier: Apache-2.0
// The directory in which a join stages its files.
#include "collectors.h"

#include "fileaccess.h"
#include "wellknownpaths.h"

#include <QFileInfo>
#include <QJsonArray>

namespace {

constexpr uint kSticky = 01000;
constexpr uint kOthersWrite = 022;

bool isSafe(const FileAccess &directory)
{
    const bool isKept = (directory.mode & kSticky) != 0 || (directory.mode & kOthersWrite) == 0;
    return directory.isDirectory && directory.ownerId == 0 && isKept;
}

Finding directoryFinding(const QString &path)
{
    const QString key = QStringLiteral("staging");
    const FileAccess directory = FileAccess::of(path);
    const QJsonObject value = directory.toJson(path);
    if (directory.isAbsent())
        return Finding::none(key, value, Text::tr("%1 is not there: a join makes it").arg(path));
    if (isSafe(directory))
        return Finding::ok(key, value, directory.toText(path));
    return Finding::fault(
        key, value, Text::tr("%1 is not a sticky directory of root's").arg(directory.toText(path)),
        Text::tr("systemd-tmpfiles --remove --create veskw.conf, which removes what is in it"));
}

} // namespace

Findings stagingFindings()
{
    const QString directory = QFileInfo(QString::fromUtf8(vesk::kTmpUserinfoPath)).path();
    QJsonArray files;
    QStringList lines;
    for (const char *name :
         {vesk::kTmpUserinfoPath, vesk::kTmpCaCertPath, vesk::kTmpPublicKeyPath, vesk::kTmpPrivateKeyPath}) {
        const QString path = QString::fromUtf8(name);
        const FileAccess file = FileAccess::of(path);
        if (file.isAbsent())
            continue;
        files.append(file.toJson(path));
        lines.append(file.toText(path));
    }
    const QString key = QStringLiteral("staged");
    if (files.isEmpty())
        return {directoryFinding(directory), Finding::none(key, files, Text::tr("nothing is staged"))};
    return {directoryFinding(directory),
            Finding::none(
                key, files, lines.join(QStringLiteral(", ")),
                Text::tr("from a join that waits for its reboot, or was given up; the reboot removes it"))};
}
