// SPDX-License-Identifier: Apache-2.0
#include "worldlock.h"

#include <QFileInfo>

#include <sys/file.h>

namespace sandbox {

bool WorldLock::take(QString *error)
{
    if (!m_file.open(QIODevice::ReadWrite)) {
        *error = QStringLiteral("%1: %2").arg(m_file.fileName(), m_file.errorString());
        return false;
    }
    if (::flock(m_file.handle(), LOCK_EX | LOCK_NB) == 0)
        return true;
    m_file.close();
    *error = QStringLiteral("another world runs in %1").arg(QFileInfo(m_file).absolutePath());
    return false;
}

} // namespace sandbox
