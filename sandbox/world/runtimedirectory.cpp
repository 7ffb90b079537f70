// SPDX-License-Identifier: Apache-2.0
#include "runtimedirectory.h"

#include <QDir>

#include <cerrno>
#include <cstdlib>
#include <cstring>

namespace sandbox {

namespace {

// A copy of a state folder points to the directory of the original, which points back to where it belongs.
constexpr char kOwner[] = "/state";

} // namespace

bool RuntimeDirectory::make(QString *error)
{
    removeStale();
    QByteArray path("/tmp/vesk-run-XXXXXX");
    if (::mkdtemp(path.data()) == nullptr) {
        *error = QStringLiteral("cannot make %1: %2")
                     .arg(QString::fromLatin1(path), QString::fromLocal8Bit(std::strerror(errno)));
        return false;
    }
    m_path = QString::fromLatin1(path);
    if (QFile::link(m_state.path(), m_path + QLatin1String(kOwner)) && QFile::link(m_path, m_state.runLink()))
        return true;
    *error = QStringLiteral("cannot make %1").arg(m_state.runLink());
    remove();
    return false;
}

void RuntimeDirectory::remove()
{
    if (m_path.isEmpty())
        return;
    QDir(m_path).removeRecursively();
    if (m_state.run() == m_path)
        QFile::remove(m_state.runLink());
    m_path.clear();
}

void RuntimeDirectory::removeStale() const
{
    const QString stale = m_state.run();
    if (stale.isEmpty())
        QDir(m_state.runLink()).removeRecursively(); // where worlds had their sockets once
    else if (QFile::symLinkTarget(stale + QLatin1String(kOwner)) == m_state.path())
        QDir(stale).removeRecursively();
    QFile::remove(m_state.runLink());
}

} // namespace sandbox
