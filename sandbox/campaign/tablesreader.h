// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/campaigntables.h"

#include <optional>

namespace sandbox {

class StrictObject;

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
    struct Stage;
    struct Fault;

    static Stage readStage(const QString &name, StrictObject &object);
    static Fault readFault(const QString &name, StrictObject &object);
    void addRow(const Stage &stage, const Fault &fault, const QJsonObject &exception);
    QJsonObject outcomeOf(const Stage &stage, const Fault &fault) const;
    Expectation expectationOf(const Row &row, const Stage &stage, const Fault &fault,
                              const QJsonObject &merged) const;
    QMap<QString, int> askedBy(const Stage &stage, bool isSeen, bool goesOn) const;

    CampaignTables &m_tables;
    QString m_group;
};

} // namespace sandbox
