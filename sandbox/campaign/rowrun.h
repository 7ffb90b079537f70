// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/campaigntables.h"
#include "campaign/journalwatch.h"
#include "campaign/rowactions.h"
#include "campaign/secretwatch.h"
#include "world/world.h"

namespace sandbox {

// One row, in a process of its own: a world in `state` (a folder that is copied there beforehand), the
// program in it, the autopilot at its window, and a look at everything afterwards. Runs once.
class RowRun
{
public:
    // program: path of what is started as veskw.
    RowRun(const CampaignTables &tables, const Row &row, QString state, QString program);

    // What was seen other than expected, one line each; empty: the row passes.
    QStringList run();

private:
    bool start();
    bool startProgram();
    void actWhenReady();
    void walk(const QString &journey, const QString &page, const QStringList &boxes);
    void checkWalk();
    void checkEnd();
    bool isToEnd() const;
    QString pageOfEnd() const;
    bool renew(QString *error);
    void checkClose();
    void tryNext();
    QMap<QString, int> callsOfNext() const;

    bool writeScenario();
    QString writeExpectation(const QString &page, const QStringList &boxes);
    void fillPorts();
    void complain(const QString &text) { m_complaints.append(text); }

    const CampaignTables &m_tables;
    const Row &m_row;
    StateFolder m_state;
    QString m_program;
    QString m_scenarioFile;
    QStringList m_complaints;
    std::unique_ptr<World> m_world;
    std::unique_ptr<JournalWatch> m_journal;
    std::unique_ptr<RowActions> m_actions;
    bool m_isMended = false; // the next attempt is under way
    int m_exitCode = 0;      // of the program, when it has ended
};

} // namespace sandbox
