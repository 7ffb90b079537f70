// SPDX-License-Identifier: Apache-2.0
#include "rundirectory.h"

#include "journal/error.h"
#include "journal/smallfile.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <sys/stat.h>

namespace sandbox {

RunDirectory::RunDirectory(const QString &root)
    : m_root(root)
    , m_scratch(QDir::tempPath() + QStringLiteral("/vesk-isolate-XXXXXX"))
{
}

RunDirectory::~RunDirectory()
{
    while (!m_mountPoints.isEmpty()) {
        const QString path = m_mountPoints.takeLast();
        if (QFileInfo(path).isDir())
            QDir().rmdir(path);
        else if (QFileInfo(path).size() == 0)
            QFile::remove(path);
    }
}

void RunDirectory::forgetMountPoints(const QStringList &paths)
{
    for (const QString &inside : paths) {
        QStringList missing;
        for (QString path = m_root + inside; !QFileInfo::exists(path); path = QFileInfo(path).path())
            missing.prepend(path);
        m_mountPoints += missing;
    }
}

void RunDirectory::prepare()
{
    if (!m_scratch.isValid())
        throw Error(
            QStringLiteral("cannot create a directory for this run: %1").arg(m_scratch.errorString()));
    const bool fresh = m_root.isEmpty();
    if (fresh)
        m_root = m_scratch.filePath(QStringLiteral("root"));
    const std::pair<QString, mode_t> directories[] = {{m_root + QStringLiteral("/etc/vesk"), 0755},
                                                      {m_root + QStringLiteral("/usr/share/vesk"), 0755},
                                                      {m_root + QStringLiteral("/tmp"), 01777},
                                                      {scratch("run"), 0755},
                                                      {scratch("runtime"), 0700}};
    for (const auto &[path, mode] : directories) {
        if (!QDir().mkpath(path) || ::chmod(QFile::encodeName(path).constData(), mode) != 0)
            throw Error(QStringLiteral("cannot create %1").arg(path));
    }
    if (fresh)
        writeTerminalFiles(m_root);
    m_root = QFileInfo(m_root).canonicalFilePath();
    QFile::copy(m_root + QStringLiteral("/etc/hosts"), hostTable());
}

void RunDirectory::writeTerminalFiles(const QString &root)
{
    smallfile::write(root + QStringLiteral("/etc/hostname"), "terminal-01\n");
    smallfile::write(root + QStringLiteral("/etc/hosts"), "127.0.0.1 localhost terminal-01 uim.vesk.test\n"
                                                          "::1 localhost\n");
}

} // namespace sandbox
