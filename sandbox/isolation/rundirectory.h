// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>
#include <QTemporaryDir>

namespace sandbox {

// The directory whose content the isolated command sees at the replaced paths, and a scratch directory for
// the isolation tool itself. A given directory is completed and kept. A fresh one is made below the caller's
// temporary directory, filled like a terminal's, and removed with this object, as the scratch directory
// always is.
class RunDirectory
{
public:
    // root: existing or new directory to keep, or empty for a fresh one.
    explicit RunDirectory(const QString &root);
    ~RunDirectory();
    Q_DISABLE_COPY_MOVE(RunDirectory)

    void prepare(); // throws an Error

    // Mount points that the isolation tool will make below root() are no files of the terminal's: they go
    // with this object. paths: where the command sees them.
    void forgetMountPoints(const QStringList &paths);

    // Absolute, without symbolic links. Valid after prepare().
    QString root() const { return m_root; }
    QString scratch(const char *entry) const { return m_scratch.filePath(QLatin1String(entry)); }
    // A copy of root()/etc/hosts, which can be changed while the command runs; there is none without the
    // original.
    QString hostTable() const { return scratch("hosts"); }

    static void writeTerminalFiles(const QString &root);

private:
    QString m_root;
    QStringList m_mountPoints; // that are not there yet, parents first
    QTemporaryDir m_scratch;
};

} // namespace sandbox
