// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "isolationoptions.h"

#include <QStringList>
#include <QVector>

namespace sandbox {

class RunDirectory;

// What an isolated command sees that the machine does not have there, independent of the tool that makes it
// so. Used by the back ends only.
class View
{
public:
    View(const IsolationOptions &options, const RunDirectory &run);

    // In the order of mounting: a later one may lie inside an earlier one.
    const QVector<Bind> &binds() const { return m_binds; }
    // Files of the machine that do not exist inside.
    const QStringList &absent() const { return m_absent; }
    // Paths of the machine that show inside the replaced ones.
    QStringList mountPoints() const;

    // Paths of the command's own that turn read-only once everything is in its place.
    const QStringList &readOnly() const { return m_readOnly; }

    // Directory that the command starts in.
    QString workingDirectory() const { return m_workingDirectory; }

private:
    void addRuntimeDirectory(const QString &own);
    bool isCovered(const QString &path) const;
    void showIfCovered(const QString &path);

    QVector<Bind> m_wanted;
    QVector<Bind> m_binds;
    QStringList m_absent;
    QStringList m_readOnly;
    QString m_workingDirectory;
};

} // namespace sandbox
