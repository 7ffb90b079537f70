// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFile>

namespace sandbox {

// The claim of one world on its state folder. The kernel ends it with the process.
class WorldLock
{
public:
    explicit WorldLock(const QString &path)
        : m_file(path)
    {
    }

    bool take(QString *error);
    void release() { m_file.close(); }

private:
    QFile m_file;
};

} // namespace sandbox
