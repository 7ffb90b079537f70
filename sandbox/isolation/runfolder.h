// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QTemporaryDir>

namespace sandbox {

// The folder whose content the isolated command sees at the replaced paths, and a scratch folder for the
// isolation tool itself. A given folder is completed and kept. A fresh one is made below the caller's
// temporary directory, filled like a terminal's, and removed with this object, as the scratch folder always
// is.
class RunFolder
{
public:
    // root: existing or new folder to keep, or empty for a fresh one.
    explicit RunFolder(const QString &root);

    bool prepare(QString *error);

    // Absolute, without symbolic links. Valid after prepare().
    QString root() const { return m_root; }
    QString scratch() const { return m_scratch.path(); }

    static void writeTerminalFiles(const QString &root);

private:
    QString m_root;
    QTemporaryDir m_scratch;
};

} // namespace sandbox
