// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/campaignoptions.h"
#include "campaign/campaigntables.h"
#include "world/unixsignals.h"

#include <QElapsedTimer>
#include <QProcess>
#include <QTemporaryDir>

#include <map>
#include <memory>

namespace sandbox {

// What came of a row.
struct RowResult
{
    const Row *row = nullptr;
    bool passed = false;
};

// A run of the campaign: each chosen row in a process and a world of its own, several at a time, and a line
// for each as it ends. Worlds of rows that pass are removed, the others stay for a look.
class Campaign : public QObject
{
    Q_OBJECT

public:
    Campaign(CampaignTables tables, CampaignOptions options);

    // 0 when all rows pass, 1 when one fails or the campaign cannot run, 128 + signal.
    int run();

private:
    struct Job
    {
        const Row *row = nullptr;
        QString state;
        QElapsedTimer time;
        std::unique_ptr<QProcess> process;
    };

    bool prepare(QString *error);
    bool prepareFresh(QString *error) const;
    bool prepareJoined(QString *error) const;
    void startJobs();
    void startJob(const Row &row);
    void onEnd(int number);
    void tell(const Job &job, bool passed, const QByteArray &output);
    int summary();

    QString at(const QString &name) const { return m_folder + QLatin1Char('/') + name; }

    CampaignTables m_tables;
    CampaignOptions m_options;
    std::unique_ptr<QTemporaryDir> m_temporary; // null when a folder is given
    QString m_folder;
    QVector<const Row *> m_waiting;
    std::map<int, Job> m_jobs; // by number of the row
    QVector<RowResult> m_results;
    QString m_error; // of the campaign itself, which ends with it
    int m_next = 0;
    int m_leftOut = 0;
    UnixSignals m_signals;
};

} // namespace sandbox
