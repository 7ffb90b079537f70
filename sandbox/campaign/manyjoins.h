// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/campaigntables.h"
#include "campaign/viewfiles.h"

namespace sandbox {

// A row that joins many times in a row, each time in a new world, as a user of `vesk-sandbox` would have it,
// restart included. Nothing may be left of any of them: no process, no socket, no scratch folder.
class ManyJoins
{
public:
    // state: folder for the worlds, one at a time.
    ManyJoins(const CampaignTables &tables, const Row &row, QString state);

    // What was seen other than expected, one line each; ends at the first join that shows something.
    QStringList run();

private:
    QStringList joinOnce(int number);
    QString leftovers(const QString &world, const QString &scratch) const;

    const CampaignTables &m_tables;
    const Row &m_row;
    QString m_state;
    ViewFiles m_before;
};

} // namespace sandbox
