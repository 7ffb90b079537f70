// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/campaigntables.h"

namespace sandbox {

class StrictObject;
struct TableStage;
struct TableFault;

// Makes the rows of one group file; used by CampaignTables::load only. Throws JsonTrouble.
class TablesReader
{
public:
    TablesReader(CampaignTables &tables, QString group)
        : m_tables(tables)
        , m_group(std::move(group))
    {
    }

    void read(StrictObject &top);
    static void readJourneys(StrictObject &top, CampaignTables &tables);
    static void readFiles(StrictObject &top, CampaignTables &tables);

private:
    void addRow(const TableStage &stage, const TableFault &fault, const QJsonObject &exception);
    QString filledIn(QString moment, const TableStage &stage) const;
    Expectation expectationOf(const Row &row, const TableStage &stage, const TableFault &fault,
                              const QJsonObject &outcome) const;
    void readNext(StrictObject &object, NextAttempt &next) const;
    ExpectedCalls askedBy(const TableStage &stage, bool isSeen, bool goesOn) const;

    CampaignTables &m_tables;
    QString m_group;
};

} // namespace sandbox
