// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/rows/campaigntables.h"
#include "campaign/testresults.h"

namespace sandbox {

// What became of the rows that ran, as a document in Markdown: an overview by group, then for each stage the
// faults, gathered by what the user sees.
class Report
{
public:
    // tables: outlive the report.
    Report(const CampaignTables &tables, const TestResults &results);

    QString text() const;

private:
    QString overview() const;
    QString stageText(const QVector<const Row *> &rows) const;

    QVector<QVector<const Row *>> m_stages; // in the order of the tables
    QSet<QString> m_failed;                 // ids
};

} // namespace sandbox
