// SPDX-License-Identifier: Apache-2.0
#include "view.h"

#include "rundirectory.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>

#include <algorithm>

namespace sandbox {

namespace {

constexpr const char *kReplaced[] = {"/etc/vesk", "/usr/share/vesk", "/tmp"};

bool isBelow(const QString &path, const QString &directory)
{
    return path == directory || path.startsWith(directory + QLatin1Char('/'));
}

} // namespace

View::View(const IsolationOptions &options, const RunDirectory &run)
    : m_wanted(options.binds)
    , m_readOnly(options.readOnly)
    , m_workingDirectory(QDir::currentPath())
{
    for (const char *path : kReplaced)
        m_binds.append({run.root() + QLatin1String(path), QLatin1String(path), true});
    const std::pair<QString, QString> files[] = {
        {run.root() + QStringLiteral("/etc/hostname"), QStringLiteral("/etc/hostname")},
        {run.hostTable(), QStringLiteral("/etc/hosts")}};
    for (const auto &[host, inside] : files) {
        if (QFileInfo::exists(host))
            m_binds.append({host, inside, true});
        else
            m_absent.append(inside);
    }
    // The sockets of the machine's services and of the user's session.
    m_binds.append({run.scratch("run"), QStringLiteral("/run"), true});
    addRuntimeDirectory(run.scratch("runtime"));
    // A build, a display or a command that lives there has to stay reachable, and what name resolution reads.
    showIfCovered(
        QFileInfo(QCoreApplication::applicationDirPath() + QStringLiteral("/..")).canonicalFilePath());
    showIfCovered(QStringLiteral("/tmp/.X11-unix"));
    showIfCovered(qEnvironmentVariable("XAUTHORITY"));
    showIfCovered(QFileInfo(QStringLiteral("/etc/resolv.conf")).canonicalFilePath());
    if (options.command.constFirst().contains(QLatin1Char('/')))
        showIfCovered(QFileInfo(options.command.constFirst()).absoluteFilePath());
    m_binds += m_wanted;
    if (isCovered(m_workingDirectory))
        m_workingDirectory = QStringLiteral("/");
}

QStringList View::mountPoints() const
{
    QStringList result;
    for (const Bind &bind : m_binds) {
        for (const char *replaced : kReplaced) {
            if (bind.inside.startsWith(QLatin1String(replaced) + QLatin1Char('/')))
                result.append(bind.inside);
        }
    }
    return result;
}

// An empty one, with the socket of a display in it that is there and not below /tmp.
void View::addRuntimeDirectory(const QString &own)
{
    const QString path = QDir::cleanPath(qEnvironmentVariable("XDG_RUNTIME_DIR"));
    const bool isReplaced =
        std::any_of(m_binds.cbegin(), m_binds.cend(), [&](const Bind &bind) { return bind.inside == path; });
    if (isReplaced || !isCovered(path) || !QFileInfo::exists(path))
        return;
    m_binds.append({own, path, true});
    const QString display = qEnvironmentVariable("WAYLAND_DISPLAY");
    if (!display.isEmpty())
        showIfCovered(QDir(path).absoluteFilePath(display));
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

// What the caller has asked for in its place stays.
void View::showIfCovered(const QString &path)
{
    const bool isWanted = std::any_of(m_wanted.cbegin(), m_wanted.cend(),
                                      [&](const Bind &bind) { return isBelow(path, bind.inside); });
    if (!isWanted && isCovered(path) && QFileInfo::exists(path))
        m_binds.append({path, path, false});
}

} // namespace sandbox
