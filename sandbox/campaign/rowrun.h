// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/checks/secretwatch.h"
#include "campaign/rows.h"
#include "play/actions.h"
#include "play/journalwatch.h"
#include "world/world.h"

#include <QElapsedTimer>

#include <optional>

namespace sandbox {

// One row, in a process of its own: a world in `state` (a directory that is copied there beforehand), the
// program in it, the autopilot at its window, and a look at everything afterwards. Runs once.
class RowRun
{
public:
    // program: path of what is started as veskw.
    RowRun(const Rows &rows, const Row &row, QString state, QString program);

    // Differences from what was expected, one line each; empty: the row passes.
    QStringList run();

private:
    void start();
    void attemptAll();
    void startProgram();
    void walk(const QString &journey, const char *page, const char *messages);
    void checkWalk();
    void checkEnd();
    bool endsByItself() const { return m_expect.contains(QLatin1String("exit")) && !m_isRepaired; }
    bool isToEnd() const
    {
        return endsByItself() || (m_expect.contains(QLatin1String("ends")) && !m_isRepaired);
    }
    bool mayClose() const { return m_expect.value(QLatin1String("close")) != QLatin1String("refused"); }
    void renew();
    void checkClose();
    void tryNext();
    ExpectedCalls callsIn(const char *key, int incomplete) const;
    void checkCalls(const QString &journey, const ExpectedCalls &expected);
    void checkSilence();
    void checkFiles(const char *files, const char *settings);
    QJsonObject nextScenario(const QString &journey) const;
    ViewFiles mountPoints();

    QString writeExpectation(const char *page, const char *messages);
    void fillPorts();
    void complain(const QString &text) { m_complaints.append(text); }

    const Rows &m_rows;
    const Row &m_row;
    QJsonObject m_expect;
    QString m_journey;
    QString m_next; // how the next attempt begins
    StateDirectory m_state;
    QString m_program;
    QString m_scenarioFile;
    QStringList m_complaints;
    std::unique_ptr<World> m_world;
    ViewFiles m_before; // the first attempt
    QStringList m_settings;
    QVector<Placeholders> m_attempts; // the one in progress is the last
    std::unique_ptr<JournalWatch> m_journal;
    QElapsedTimer m_latestLine; // of the journal
    qint64 m_silence = 0;       // the longest between two of them, in ms
    int m_from = 0;             // where the attempt begins in the journal
    int m_checked = 0;          // up to where its calls were compared
    SyscallFault m_fault;
    std::unique_ptr<Actions> m_actions;
    bool m_isRepaired = false; // the next attempt is in progress
    int m_exitCode = 0;        // of the program, when it has ended
};

} // namespace sandbox
