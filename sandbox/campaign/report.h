// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/campaign.h"

namespace sandbox {

// The summary of a run as a document: for each stage what must be seen, and after which faults it was. Equal
// results give an equal text.
class Report
{
public:
    explicit Report(QVector<RowResult> results);

    bool write(const QString &path, QString *error) const;
    QString text() const;

private:
    QString overview() const;
    QString groupText(const QString &group) const;
    QString stageText(const QString &group, const QString &stage) const;
    QStringList groups() const;
    QStringList stagesOf(const QString &group) const;

    QVector<RowResult> m_results; // in the order of the tables
};

} // namespace sandbox
