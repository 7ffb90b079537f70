// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/rows/row.h"

#include <optional>

namespace sandbox {

// The tables of the campaign, read from a directory:
//     journeys.json   which calls a join and a leave make, and how they end
//     files.json      what can lie in /tmp/vesk and /etc/vesk, by the name of the state
//     GROUP.json      stages, faults and what comes of each fault at each stage; every other file
// The rows are the product of stages and faults. What breaks the schema or fits nothing else (a fault class
// without outcome, an exception for a row that is not there) is one line that names file and key.
class CampaignTables
{
public:
    // "../share/vesk-sandbox/campaign" beside the directory of the running program.
    static QString standardDirectory();
    // row: id of the one that is wanted, so that only the file of its group is read; empty: all are.
    static std::optional<CampaignTables> load(const QString &directory, QString *error,
                                              const QString &row = {});

    const QVector<Row> &rows() const { return m_rows; } // by group (file name), stage, fault
    // By its id, or by another name that it has in names.json.
    const Row *row(const QString &name) const;
    QMap<QString, QString> otherNames() const { return m_otherNames; } // ids by name
    JourneyPlan journey(const QString &name) const { return m_journeys.value(name); }
    // By path of ViewFiles: "absent", or mode ("0600", "*" for any), a blank, and what stands there:
    // "directory" and the like, and of a file "empty", "key", "certificate", "record true", "other", "any".
    // What lies elsewhere must be as it was at the start of the row.
    QMap<QString, QString> files(const QString &state) const { return m_files.value(state); }
    // What may be there in every state.
    QMap<QString, QString> filesOfAll() const { return m_filesOfAll; }

private:
    friend class TableReader;

    QMap<QString, JourneyPlan> m_journeys;
    QJsonObject m_wider; // classes of faults by the class whose outcome they share where they have none
    QMap<QString, QMap<QString, QString>> m_files;
    QMap<QString, QString> m_filesOfAll;
    QMap<QString, QString> m_otherNames;
    QVector<Row> m_rows;
};

} // namespace sandbox
