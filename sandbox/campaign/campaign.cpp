// SPDX-License-Identifier: Apache-2.0
#include "campaign/campaign.h"

#include "campaign/report.h"
#include "campaign/rowneeds.h"
#include "world/tools.h"
#include "world/world.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QRegularExpression>

#include <cstdio>

namespace sandbox {

namespace {

constexpr int kJoinLimitMs = 120000;
constexpr int kMostTold = 20; // what is wrong with one row

void say(const QString &line)
{
    std::printf("%s\n", qPrintable(line));
    std::fflush(stdout);
}

int fail(const QString &error)
{
    std::fprintf(stderr, "vesk-sandbox: %s\n", qPrintable(error));
    return 1;
}

bool copyFolder(const QString &from, const QString &to)
{
    return !QFileInfo::exists(to) &&
           QProcess::execute(QStringLiteral("cp"), {QStringLiteral("-a"), from, to}) == 0;
}

// What a stopped world leaves behind and a copy must not have.
bool forgetRun(const QString &state, QString *error)
{
    bool good = true;
    for (const char *entry : {"journal.log", "program.log", "program.position", "world.log", "lock"}) {
        const QString path = state + QLatin1Char('/') + QLatin1String(entry);
        good = (QFile::remove(path) || !QFileInfo::exists(path)) && good;
    }
    good = QDir(state + QStringLiteral("/pictures")).removeRecursively() && good;
    QFile journal(state + QStringLiteral("/journal.log"));
    good = journal.open(QIODevice::WriteOnly) && good; // the sign of a world
    if (!good)
        *error = QStringLiteral("cannot make %1 as if it had not run").arg(state);
    return good;
}

} // namespace

Campaign::Campaign(CampaignTables tables, CampaignOptions options)
    : m_tables(std::move(tables))
    , m_options(std::move(options))
{
    const QRegularExpression only(
        QRegularExpression::anchoredPattern(QRegularExpression::wildcardToRegularExpression(m_options.only)
                                                .replace(QStringLiteral("[^/]"), QStringLiteral("."))));
    for (const Row &row : m_tables.rows()) {
        const bool isChosen = m_options.only.isEmpty() || only.match(row.id()).hasMatch();
        if (isChosen && (row.isFast || !m_options.isFast))
            m_waiting.append(&row);
    }
    connect(&m_signals, &UnixSignals::received, this,
            [](int number) { QCoreApplication::exit(128 + number); });
}

int Campaign::run()
{
    if (m_options.isListed) {
        for (const Row *row : m_waiting)
            say(QStringLiteral("%1  %2").arg(row->id(), row->title));
        return 0;
    }
    QString error;
    if (m_waiting.isEmpty())
        error = QStringLiteral("no row matches \"%1\"").arg(m_options.only);
    if (!error.isEmpty() || !prepare(&error))
        return fail(error);
    startJobs();
    const int exitCode = m_error.isEmpty() ? QCoreApplication::exec() : 1;
    for (const auto &job : m_jobs)
        job.second.process->disconnect(this);
    m_jobs.clear(); // where a signal ended the campaign
    if (!m_error.isEmpty())
        return fail(m_error);
    return exitCode >= 128 ? exitCode : summary();
}

// Two worlds to copy from: one in which nothing has happened yet, one in which the terminal has joined.
bool Campaign::prepare(QString *error)
{
    if (m_options.program.isEmpty())
        m_options.program = findTool(QStringLiteral("veskw"), error);
    if (!error->isEmpty())
        return false;
    m_folder = m_options.keep;
    if (m_folder.isEmpty()) {
        m_temporary =
            std::make_unique<QTemporaryDir>(QDir::tempPath() + QStringLiteral("/vesk-campaign-XXXXXX"));
        m_folder = m_temporary->path();
    }
    m_folder = QFileInfo(m_folder).absoluteFilePath();
    if (!QDir().mkpath(m_folder)) {
        *error = QStringLiteral("cannot make the folder %1").arg(m_folder);
        return false;
    }
    return prepareFresh(error) && prepareJoined(error);
}

bool Campaign::prepareFresh(QString *error) const
{
    WorldOptions options;
    options.state = at(QStringLiteral("join"));
    options.scenarioFile = Scenario::standardFolder() + QStringLiteral("/join-ok.json");
    World world(options);
    if (!world.start(error))
        return false;
    world.stop();
    return forgetRun(options.state, error);
}

bool Campaign::prepareJoined(QString *error) const
{
    const QString state = at(QStringLiteral("leave"));
    const QString program = findTool(QStringLiteral("vesk-sandbox"), error);
    QProcess join;
    join.setProcessChannelMode(QProcess::MergedChannels);
    join.start(program, {QStringLiteral("--state"), state, QStringLiteral("--headless"),
                         QStringLiteral("--autopilot"), QStringLiteral("join")});
    if (!join.waitForFinished(kJoinLimitMs) || join.exitCode() != 0) {
        *error = QStringLiteral("no terminal joins that could leave afterwards: %1")
                     .arg(QString::fromUtf8(join.readAll()));
        return false;
    }
    return forgetRun(state, error);
}

void Campaign::startJobs()
{
    while (m_error.isEmpty() && static_cast<int>(m_jobs.size()) < m_options.jobs && m_next < m_waiting.size())
        startJob(*m_waiting.at(m_next));
    if (m_jobs.empty())
        QCoreApplication::exit(0);
}

void Campaign::startJob(const Row &row)
{
    const int number = m_next++;
    Job &job = m_jobs[number];
    job.row = &row;
    job.state = at(QStringLiteral("%1").arg(number + 1, 4, 10, QLatin1Char('0')));
    job.time.start();
    job.process = std::make_unique<Child>(QString());
    job.process->setStandardErrorFile(QString());
    job.process->setProcessChannelMode(QProcess::MergedChannels);
    connect(job.process.get(), qOverload<int, QProcess::ExitStatus>(&QProcess::finished), this,
            [this, number] { onEnd(number); });
    if (!copyFolder(at(row.journey), job.state)) {
        m_error = QStringLiteral("cannot copy the world %1 to %2").arg(at(row.journey), job.state);
        QCoreApplication::exit(1);
        return;
    }
    job.process->start(QCoreApplication::applicationFilePath(),
                       {QStringLiteral("campaign-row"), row.id(), QStringLiteral("--state"), job.state,
                        QStringLiteral("--program"), m_options.program});
}

void Campaign::onEnd(int number)
{
    const Job &job = m_jobs.at(number);
    const bool isLeftOut =
        job.process->exitStatus() == QProcess::NormalExit && job.process->exitCode() == rowneeds::kLeftOut;
    const bool passed = job.process->exitStatus() == QProcess::NormalExit && job.process->exitCode() == 0;
    if (isLeftOut) {
        say(QStringLiteral("SKIP  %1: %2")
                .arg(job.row->id(), QString::fromUtf8(job.process->readAll().trimmed())));
        ++m_leftOut;
    } else {
        tell(job, passed, job.process->readAll());
        m_results.append({job.row, passed});
    }
    if ((passed || isLeftOut) && m_options.keep.isEmpty())
        QDir(job.state).removeRecursively();
    if (!passed && !isLeftOut && m_temporary)
        m_temporary->setAutoRemove(false);
    // The process is the sender of the signal that brought us here.
    m_jobs.at(number).process.release()->deleteLater();
    m_jobs.erase(number);
    startJobs();
}

void Campaign::tell(const Job &job, bool passed, const QByteArray &output)
{
    say(QStringLiteral("%1  %2 %3 %4 %5 s")
            .arg(passed ? QStringLiteral("PASS") : QStringLiteral("FAIL"), job.row->group.leftJustified(8),
                 job.row->stage.leftJustified(16), job.row->fault.leftJustified(28))
            .arg(static_cast<double>(job.time.elapsed()) / 1000, 0, 'f', 1));
    if (passed)
        return;
    const QList<QByteArray> lines = output.trimmed().split('\n');
    for (const QByteArray &line : lines.mid(0, kMostTold))
        say(QStringLiteral("      %1").arg(QString::fromUtf8(line)));
    if (lines.size() > kMostTold)
        say(QStringLiteral("      and %1 more").arg(lines.size() - kMostTold));
    say(QStringLiteral("      left in %1").arg(job.state));
}

int Campaign::summary()
{
    int failed = 0;
    for (const RowResult &result : m_results)
        failed += result.passed ? 0 : 1;
    say(QStringLiteral("%1 rows, %2 failed, %3 left out").arg(m_results.size()).arg(failed).arg(m_leftOut));
    QString error;
    if (!m_options.report.isEmpty() && !Report(m_results).write(m_options.report, &error))
        return fail(error);
    return failed == 0 ? 0 : 1;
}

} // namespace sandbox
