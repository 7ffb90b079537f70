// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/row.h"

#include <optional>

namespace sandbox {

// The tables of the campaign, read from a folder:
//     journeys.json   which calls a join and a leave make, and how they end
//     files.json      what can lie in /tmp/vesk and /etc/vesk, by the name of the state
//     GROUP.json      stages, faults and what comes of each fault at each stage; every other file
// The rows are the product of stages and faults. A slip in a file (unknown key, fault class without outcome,
// exception for a row that is not there) is one line that names file and key.
class CampaignTables
{
public:
    // "../share/vesk-sandbox/campaign" beside the folder of the running program.
    static QString standardFolder();
    static std::optional<CampaignTables> load(const QString &folder, QString *error);

    const QVector<Row> &rows() const { return m_rows; } // by group (file name), stage, fault
    const Row *row(const QString &id) const;
    JourneyPlan journey(const QString &name) const { return m_journeys.value(name); }
    // By path of ViewFiles: "absent", or mode ("0600", "*" for any), a blank, and what stands there:
    // "directory", or what a file holds ("record false", "record true" (is_Domain), "ca", "certificate",
    // "key", "empty" or "any").
    QMap<QString, QString> files(const QString &state) const { return m_files.value(state); }
    // What may come into being in every row. A path that ends in a slash stands for all below.
    QMap<QString, QString> filesOfAll() const { return m_filesOfAll; }

private:
    friend class TablesReader;

    QVector<Row> m_rows;
    QMap<QString, JourneyPlan> m_journeys;
    QMap<QString, QMap<QString, QString>> m_files;
    QMap<QString, QString> m_filesOfAll;
};

} // namespace sandbox
