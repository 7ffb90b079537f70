// SPDX-License-Identifier: Apache-2.0
#include "view.h"

#include "runfolder.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>

namespace sandbox {

namespace {

constexpr qint64 kLongestCopy = 1024LL * 1024;

bool isBelow(const QString &path, const QString &folder)
{
    return path == folder || path.startsWith(folder + QLatin1Char('/'));
}

QStringList existing(const QStringList &paths)
{
    QStringList result;
    for (const QString &path : paths) {
        if (QFileInfo::exists(path))
            result.append(path);
    }
    return result;
}

} // namespace

View::View(const IsolationOptions &options, const RunFolder &folder)
    : m_workingFolder(QDir::currentPath())
{
    for (const char *path : {"/etc/vesk", "/usr/share/vesk", "/tmp"})
        m_binds.append({folder.root() + QLatin1String(path), QLatin1String(path), true});
    // A build, a display or a command that lives below /tmp has to stay reachable.
    showIfCovered(
        QFileInfo(QCoreApplication::applicationDirPath() + QStringLiteral("/..")).canonicalFilePath());
    showIfCovered(QStringLiteral("/tmp/.X11-unix"));
    showIfCovered(qEnvironmentVariable("XAUTHORITY"));
    if (options.command.constFirst().contains(QLatin1Char('/')))
        showIfCovered(QFileInfo(options.command.constFirst()).absoluteFilePath());
    m_binds += options.binds;
    m_readOnly = options.readOnly;
    if (isCovered(m_workingFolder))
        m_workingFolder = QStringLiteral("/");
}

QStringList View::copies()
{
    return {QStringLiteral("/etc/hostname"), QStringLiteral("/etc/hosts")};
}

bool View::canCopy(const QString &path)
{
    const QFileInfo info(path);
    return !info.exists() || (info.isFile() && info.size() <= kLongestCopy);
}

QStringList View::hiddenFolders()
{
    return existing({QStringLiteral("/run/dbus")});
}

QStringList View::hiddenFiles()
{
    return existing({QStringLiteral("/run/systemd/private")});
}

bool View::isCovered(const QString &path) const
{
    bool covered = false;
    for (const Bind &bind : m_binds) {
        if (isBelow(path, bind.inside))
            covered = bind.host + path.mid(bind.inside.size()) != path;
    }
    return covered;
}

void View::showIfCovered(const QString &path)
{
    if (isCovered(path) && QFileInfo::exists(path))
        m_binds.append({path, path, false});
}

} // namespace sandbox
