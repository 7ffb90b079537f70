// SPDX-License-Identifier: Apache-2.0
#include "runtimedirectory.h"

#include "journal/error.h"

#include <QDir>

namespace sandbox {

namespace {

// A copy of a state directory points to the directory of the original, which points back to where it belongs.
constexpr char kOwner[] = "/state";

} // namespace

void RuntimeDirectory::make()
{
    removeStale();
    m_directory = std::make_unique<QTemporaryDir>(QStringLiteral("/tmp/vesk-run-XXXXXX"));
    const QString path = m_directory->path();
    if (!m_directory->isValid() || !QFile::link(m_state.path(), path + QLatin1String(kOwner)) ||
        !QFile::link(path, m_state.runLink()))
        throw Error(QStringLiteral("cannot create %1 and %2: %3")
                        .arg(path, m_state.runLink(), m_directory->errorString()));
}

void RuntimeDirectory::remove()
{
    if (m_directory && m_state.run() == m_directory->path())
        QFile::remove(m_state.runLink());
    m_directory.reset();
}

void RuntimeDirectory::removeStale() const
{
    const QString stale = m_state.run();
    if (!stale.isEmpty() && QFile::symLinkTarget(stale + QLatin1String(kOwner)) == m_state.path())
        QDir(stale).removeRecursively();
    QFile::remove(m_state.runLink());
}

} // namespace sandbox
