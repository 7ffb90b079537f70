// SPDX-License-Identifier: Apache-2.0
#include "campaign/rowrun.h"

#include "campaign/hostnames.h"
#include "campaign/jsonfile.h"
#include "campaign/liveness.h"
#include "campaign/obstacles.h"
#include "campaign/overlay.h"
#include "campaign/placeholders.h"
#include "campaign/preparation.h"
#include "campaign/processtable.h"
#include "campaign/programstart.h"
#include "campaign/windowmanager.h"
#include "campaign/worldchecks.h"
#include "campaign/worldholds.h"
#include "world/tools.h"

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QEventLoop>
#include <QFile>
#include <QJsonArray>

#include <csignal>

namespace sandbox {

namespace {

constexpr int kWalkLimitS = 60;
constexpr int kCloseLimitMs = 30000;
constexpr int kWindowLimitMs = 20000;
constexpr int kAskLimitMs = 1000;
constexpr int kSettleLimitMs = 10000;

// Serves events until the condition holds; false after the limit.
template <typename Condition>
bool serveUntil(int limitMs, Condition condition)
{
    const QDeadlineTimer limit(limitMs);
    while (!condition() && !limit.hasExpired())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    return condition();
}

} // namespace

RowRun::RowRun(const CampaignTables &tables, const Row &row, QString state, QString program)
    : m_tables(tables)
    , m_row(row)
    , m_state(std::move(state))
    , m_program(std::move(program))
    , m_scenarioFile(m_state.at("row-scenario.json"))
{
}

QStringList RowRun::run()
{
    if (!start())
        return m_complaints;
    SecretWatch secrets(m_state.path(), {m_world->scenario().input().password,
                                         m_world->scenario().input().administratorPassword});
    if (startProgram()) {
        const Expectation &expect = m_row.expect;
        if (m_actions->awaitWindow())
            actWhenReady();
        walk(m_row.journey, expect.page, expect.boxes);
        checkWalk();
        if (expect.ending != Ending::None)
            checkEnd();
        else if (m_complaints.isEmpty() && (expect.next.how != NextAttempt::How::Press || !expect.mayClose))
            checkClose();
        if (m_complaints.isEmpty() && expect.next.how != NextAttempt::How::None)
            tryNext();
    }
    if (m_journal)
        checkSilence();
    m_complaints += m_actions->complaints();
    m_world->stop();
    return secrets.leaks() + m_complaints; // a leak comes first, so that it is never among those left out
}

bool RowRun::start()
{
    WorldOptions options;
    options.state = m_state.path();
    options.scenarioFile = m_scenarioFile;
    options.virtualDisplay = true;
    options.accessible = true;
    options.apart = true;
    QString error;
    if (!writeScenario()) {
        complain(QStringLiteral("cannot write %1").arg(m_scenarioFile));
        return false;
    }
    m_world = std::make_unique<World>(options);
    QObject::connect(m_world.get(), &World::programEnded, [this](int code) { m_exitCode = code; });
    if (!m_world->start(&error)) {
        complain(error);
        return false;
    }
    fillPorts();
    const auto points = mountPoints(&error);
    if (!points || !prepareFiles(m_state, m_row.prepare, &error)) {
        complain(error);
        return false;
    }
    m_before = *points;
    m_before.insert(viewFiles(m_state));
    m_settings = worldchecks::settingsOf(m_state);
    m_journal = std::make_unique<JournalWatch>(m_state.journal().path());
    m_actions = std::make_unique<RowActions>(*m_world, m_row.actions, &m_before);
    QObject::connect(m_journal.get(), &JournalWatch::came,
                     [this](const QByteArray &line) { m_actions->onLine(line); });
    return true;
}

// What the isolation makes in the view to mount something on, for as long as a program runs in it.
std::optional<ViewFiles> RowRun::mountPoints(QString *error)
{
    const ViewFiles without = viewFiles(m_state);
    Child waiting(m_state.at("world.log"));
    if (!m_world->startBeside(
            &waiting, {QStringLiteral("sh"), QStringLiteral("-c"), QStringLiteral("echo; read -r end")},
            error))
        return std::nullopt;
    const bool runs = waiting.waitForReadyRead(kWindowLimitMs);
    ViewFiles points = viewFiles(m_state);
    waiting.closeWriteChannel();
    if (!runs || !waiting.waitForFinished(kWindowLimitMs)) {
        *error = QStringLiteral("nothing can be started in the world");
        return std::nullopt;
    }
    for (auto entry = without.begin(); entry != without.end(); ++entry)
        points.remove(entry.key());
    for (ViewEntry &entry : points)
        entry.isPassing = true;
    return points;
}

bool RowRun::startProgram()
{
    QString error;
    const ProgramStart start = programStart(m_isMended ? QJsonObject() : m_row.start, m_program,
                                            m_state.path() + QLatin1Char('/') + SecretWatch::startsName());
    if (m_world->startProgram(start.command, &error, start.isolation))
        return true;
    complain(error);
    return false;
}

void RowRun::actWhenReady()
{
    const QDeadlineTimer limit(kWindowLimitMs);
    while (!limit.hasExpired() &&
           !isAnswering(m_world->readerBusAddress(), World::programName(), kAskLimitMs))
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    m_actions->performReady();
}

void RowRun::walk(const QString &journey, const QString &page, const QStringList &boxes)
{
    QString error;
    QByteArray last; // outlives the autopilot, which speaks while it is ended
    Child autopilot(m_state.at("world.log"));
    autopilot.setProcessEnvironment(m_world->readerEnvironment());
    QObject::connect(&autopilot, &QProcess::readyReadStandardOutput, [&] {
        while (autopilot.canReadLine())
            last = autopilot.readLine().trimmed();
    });
    QStringList arguments{journey,
                          QStringLiteral("--program"),
                          World::programName(),
                          QStringLiteral("--scenario"),
                          writeExpectation(page, boxes),
                          QStringLiteral("--port"),
                          QString::number(m_world->enrolmentPort()),
                          QStringLiteral("--journal"),
                          m_state.journal().path(),
                          QStringLiteral("--timeout"),
                          QString::number(kWalkLimitS)};
    if (isToEnd())
        arguments += QStringList{QStringLiteral("--stay-after"), m_row.actions.first().on};
    autopilot.start(findTool(QStringLiteral("vesk-autopilot"), &error), arguments);
    const bool hasEnded = serveUntil((kWalkLimitS + 10) * 1000, [&] {
        return autopilot.state() == QProcess::NotRunning ||
               (isToEnd() && m_world->program().state() == QProcess::NotRunning);
    });
    m_journal->read();
    if (isToEnd())
        return;
    if (!hasEnded || autopilot.exitStatus() != QProcess::NormalExit || autopilot.exitCode() != 0)
        complain(QString::fromUtf8(last.isEmpty() ? QByteArray("the autopilot ended without a word") : last));
}

// The walk ends with the program; what was under way in the world comes to its end.
void RowRun::checkEnd()
{
    static const QMap<Ending, int> codes = {
        {Ending::Killed, 128 + SIGKILL}, {Ending::Terminated, 128 + SIGTERM}, {Ending::DisplayLost, 1}};
    const int expected = codes.value(m_row.expect.ending);
    if (!serveUntil(kCloseLimitMs, [this] { return m_world->program().state() == QProcess::NotRunning; }))
        complain(QStringLiteral("expected the end of the program, it lives"));
    else if (m_exitCode != expected)
        complain(QStringLiteral("expected exit code %1, seen %2").arg(expected).arg(m_exitCode));
}

bool RowRun::isToEnd() const
{
    return m_row.expect.ending != Ending::None && !m_isMended;
}

void RowRun::checkWalk()
{
    checkCalls(m_row.journey, m_row.expect.asked);
    if (!isToEnd() && m_world->program().state() != QProcess::Running)
        complain(QStringLiteral("the program has ended with exit code %1").arg(m_exitCode));
    checkFiles(m_row.journey, m_row.expect.files);
    m_complaints += worldchecks::log(m_state, m_row.expect.log);
    m_complaints += worldchecks::journal(m_journal->text(), m_row.expect.journal);
    m_complaints += worldHolds(m_state, m_row.expect.world);
}

void RowRun::checkCalls(const QString &journey, const ExpectedCalls &expected)
{
    const auto differs = [&] {
        m_journal->read();
        return worldchecks::calls(m_tables.journey(journey), expected, m_journal->text().mid(m_from));
    };
    serveUntil(kSettleLimitMs, [&] { return differs().isEmpty(); });
    m_complaints += differs();
    m_checked = m_journal->text().size();
}

// Nothing is called once the walk has come to its end.
void RowRun::checkSilence()
{
    m_journal->read();
    const QStringList late =
        worldchecks::calls(m_tables.journey(m_row.journey), {}, m_journal->text().mid(m_checked));
    for (const QString &complaint : late)
        complain(QStringLiteral("after the walk: %1").arg(complaint));
}

void RowRun::checkFiles(const QString &journey, const QString &files)
{
    m_complaints += worldchecks::files(m_state, m_before, m_tables, files);
    m_complaints += worldchecks::settings(m_state, m_settings, m_tables.journey(journey));
    m_settings = worldchecks::settingsOf(m_state);
}

// A window that may close ends the program, orderly; one that may not says so in the program's log.
void RowRun::checkClose()
{
    QFile log(m_state.programLog());
    if (!log.open(QIODevice::ReadOnly) || !log.seek(log.size()))
        complain(QStringLiteral("no program log"));
    WindowManager manager(m_world->environment());
    m_world->state().journal().write(QStringLiteral("world"), QStringLiteral("the campaign: close"));
    if (manager.askToClose() == 0)
        complain(QStringLiteral("no window shows that could be closed"));
    bool isRefused = false;
    const bool isAnswered = serveUntil(kCloseLimitMs, [&] {
        isRefused = isRefused || log.readAll().contains("m_bExit true");
        return isRefused || m_world->program().state() == QProcess::NotRunning;
    });
    if (!isAnswered)
        complain(QStringLiteral("the window neither closes nor refuses to"));
    else if (isRefused == m_row.expect.mayClose)
        complain(isRefused ? QStringLiteral("expected a window that may close, seen a refusal")
                           : QStringLiteral(
                                 "expected a window that refuses to close, seen the end of the program"));
    else if (!isRefused && m_exitCode != 0)
        complain(QStringLiteral("expected exit code 0 after the close, seen %1").arg(m_exitCode));
}

void RowRun::tryNext()
{
    QString error;
    checkSilence();
    const ViewFiles earlier = viewFiles(m_state);
    obstacles::clear(m_state);
    follow(earlier, viewFiles(m_state), &m_before);
    m_isMended = true;
    if (!m_world->mend(&error) || !renew(&error)) {
        complain(error);
        return;
    }
    const NextAttempt &next = m_row.expect.next;
    if (next.how == NextAttempt::How::Press)
        hostnames::restore(m_state); // a new start has a table of its own
    if (next.how == NextAttempt::How::Kill) {
        // Ends with the isolation around it, but a moment later.
        m_world->program().kill();
        serveUntil(kCloseLimitMs, [this] {
            return m_world->program().state() == QProcess::NotRunning && descendantNamed("veskw") == 0;
        });
    }
    m_journal->read();
    m_from = m_journal->text().size();
    m_checked = m_from;
    if (next.how != NextAttempt::How::Press && !startProgram())
        return;
    const int complaints = m_complaints.size();
    walk(next.journey, next.page, next.boxes);
    checkCalls(next.journey, callsOfNext());
    checkFiles(next.journey, next.files);
    for (int index = complaints; index < m_complaints.size(); ++index)
        m_complaints[index].prepend(QStringLiteral("next attempt: "));
}

// What actions of the row have stopped.
bool RowRun::renew(QString *error)
{
    bool good = true;
    for (const Action &action : m_row.actions) {
        if (action.what == QLatin1String("stop-display"))
            good = good && m_world->renewDisplay(error);
        if (action.what.endsWith(QLatin1String("-bus")))
            good = good && m_world->renewBuses(error);
    }
    return good;
}

// Pressed again, the journey goes on from the page that it stands on; a message ends it.
ExpectedCalls RowRun::callsOfNext() const
{
    const JourneyPlan plan = m_tables.journey(m_row.expect.next.journey);
    const bool isAnew = m_row.expect.next.how != NextAttempt::How::Press;
    const auto first = isAnew ? 0 : plan.pages.indexOf(m_row.expect.page);
    const QString last =
        m_row.expect.next.boxes.isEmpty() ? QString() : plan.stops.value(m_row.expect.next.boxes.last());
    ExpectedCalls calls;
    bool isOver = false;
    for (const Call &call : plan.calls) {
        const bool isMade = !isOver && (!call.isOptional || m_row.with.contains(call.name)) &&
                            plan.pages.indexOf(call.page) >= first;
        calls.times.insert(call.name, isMade ? 1 : 0);
        isOver = isOver || call.name == last;
    }
    return calls;
}

bool RowRun::writeScenario()
{
    QJsonObject scenario = m_row.scenario;
    scenario.insert(QStringLiteral("title"), m_row.id());
    if (m_row.journey == QLatin1String("leave"))
        scenario.insert(QStringLiteral("journey"), m_row.journey);
    QString error;
    const auto filled = Placeholders(m_state).fill(scenario, &error);
    if (!filled) {
        complain(error);
        return false;
    }
    // A world of this state has chosen no ports yet.
    QJsonObject config = jsonfile::read(m_state.at("server/config.json"));
    const QJsonObject server = filled->value(QLatin1String("server")).toObject();
    config = overlaid(config, server.value(QLatin1String("config")).toObject());
    config = overlaid(config, {{QStringLiteral("enrolment_port"), 0}, {QStringLiteral("managed_port"), 0}});
    return jsonfile::write(m_scenarioFile, *filled) &&
           jsonfile::write(m_state.at("server/config.json"), config);
}

QString RowRun::writeExpectation(const QString &page, const QStringList &boxes)
{
    QJsonObject scenario{{QStringLiteral("title"), m_row.id()},
                         {QStringLiteral("expect"),
                          QJsonObject{{QStringLiteral("page"), page},
                                      {QStringLiteral("messages"), QJsonArray::fromStringList(boxes)}}}};
    const QJsonValue input = jsonfile::read(m_scenarioFile).value(QLatin1String("input"));
    if (input.isObject())
        scenario.insert(QStringLiteral("input"), input);
    QString path = m_state.at("walk-scenario.json");
    jsonfile::write(path, scenario);
    return path;
}

// A terminal that has joined knows the ports of the world that it was copied from.
void RowRun::fillPorts()
{
    const QString path = m_state.inside(QStringLiteral("/etc/vesk/userinfo.json"));
    QJsonObject record = jsonfile::read(path);
    if (!record.value(QLatin1String("is_Domain")).toBool())
        return;
    record.insert(QStringLiteral("domain_port"), QString::number(m_world->enrolmentPort()));
    record.insert(QStringLiteral("server_port"), QString::number(m_world->managedPort()));
    jsonfile::write(path, record);
}

} // namespace sandbox
