// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/rows/campaigntables.h"

#include <QSet>

namespace sandbox {

// Thrown at what fits nothing else, caught where the tables are loaded. Names no file.
struct TableError
{
    QString text;
};

// Makes rows of one file of the tables, whose keys and types the schema has seen to.
class TableReader
{
public:
    TableReader(CampaignTables &tables, QString group)
        : m_tables(tables)
        , m_group(std::move(group))
    {
    }

    static void readJourneys(const QJsonObject &top, CampaignTables &tables);
    static void readFiles(const QJsonObject &top, CampaignTables &tables);
    static void readNames(const QJsonObject &top, CampaignTables &tables);
    void read(const QJsonObject &top);

private:
    void addRow(const QJsonObject &stage, const QJsonObject &fault, QJsonObject exception);
    QString outcomeName(const QJsonObject &stage, const QJsonObject &fault) const;
    QJsonObject expectation(const QJsonObject &stage, const QJsonObject &fault,
                            const QJsonObject &outcome) const;
    QJsonObject calls(const QJsonObject &stage, bool isSeen, bool goesOn, const QJsonObject &differing) const;
    QJsonArray actions(const QJsonObject &stage, const QJsonObject &fault) const;

    CampaignTables &m_tables;
    QString m_group;
    bool m_isEachOutcomeFast = false;
    QSet<QString> m_outcomes; // "stage/class" that have a row
};

} // namespace sandbox
