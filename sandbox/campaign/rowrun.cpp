// SPDX-License-Identifier: Apache-2.0
#include "campaign/rowrun.h"

#include "campaign/checks/worldchecks.h"
#include "journal/error.h"
#include "journal/smallfile.h"
#include "play/hostnames.h"
#include "play/obstacles.h"
#include "play/preparation.h"
#include "play/useractions.h"
#include "play/windowmanager.h"

#include <algorithm>

#include <csignal>

namespace sandbox {

namespace {

constexpr int kWalkLimitS = 60;
constexpr int kCloseLimitMs = 30000;
constexpr int kWindowLimitMs = 20000;
constexpr int kAskLimitMs = 1000;
constexpr int kSettleLimitMs = 10000;
constexpr qint64 kMaxSilenceMs =
    15000; // the 10 s that reaching a server may take, and what a busy machine needs

} // namespace

RowRun::RowRun(const Rows &rows, const Row &row, QString state, QString program)
    : m_rows(rows)
    , m_row(row)
    , m_expect(json::object(row.scenario, "expect"))
    , m_journey(json::text(row.scenario, "journey"))
    , m_next(json::text(m_expect, "next"))
    , m_state(std::move(state))
    , m_program(std::move(program))
    , m_scenarioFile(m_state.at("row-scenario.json"))
    , m_fault(m_state, json::object(row.scenario, "syscall"))
{
}

QStringList RowRun::run()
{
    QString error;
    if (!attempt(&error, [this] { start(); }))
        return {error};
    SecretWatch secrets(m_state.path(), {m_world->scenario().input().password,
                                         m_world->scenario().input().administratorPassword});
    if (!attempt(&error, [this] { attemptAll(); }))
        complain(error);
    checkSilence();
    m_complaints += m_actions->complaints() + m_fault.complaints();
    m_world->stop();
    return secrets.leaks() + m_complaints; // a leak comes first, so that it is never among those left out
}

void RowRun::attemptAll()
{
    m_latestLine.start();
    startProgram();
    if (m_actions->awaitWindow()) {
        serveUntil(kWindowLimitMs, [this] { return useractions::isAnswering(*m_world, kAskLimitMs); });
        m_actions->performReady();
    }
    walk(m_journey, "page", "messages");
    checkWalk();
    if (isToEnd())
        checkEnd();
    else if (m_complaints.isEmpty() && m_expect.contains(QLatin1String("close")))
        checkClose();
    if (m_complaints.isEmpty() && m_next != QLatin1String("none"))
        tryNext();
}

void RowRun::start()
{
    WorldOptions options;
    options.state = m_state.path();
    options.scenarioFile = m_scenarioFile;
    options.virtualDisplay = true;
    options.accessible = true;
    options.separateReaderBus = true;
    // A world of this state has chosen no ports yet.
    const QJsonObject ports{{QStringLiteral("enrolment_port"), 0}, {QStringLiteral("managed_port"), 0}};
    const QString config = m_state.at("server/config.json");
    m_world = std::make_unique<World>(options);
    QObject::connect(m_world.get(), &World::programEnded, [this](int code) { m_exitCode = code; });
    smallfile::saveObject(config, json::overlaid(smallfile::readObject(config), ports),
                          FileAccess::OwnerOnly);
    writeScenario(m_state, m_row.scenario, m_scenarioFile);
    m_world->start();
    fillPorts();
    const ViewFiles points = mountPoints();
    prepareFiles(m_state, json::object(m_row.scenario, "prepare"));
    m_before = points;
    m_before.insert(viewFiles(m_state));
    m_settings = worldchecks::settingsOf(m_state);
    m_attempts.append(Placeholders(m_state, m_row.scenario));
    m_journal = std::make_unique<JournalWatch>(m_state.journal().path());
    m_actions =
        std::make_unique<Actions>(*m_world, json::array(m_row.scenario, "actions"), m_fault, &m_before);
    QObject::connect(m_journal.get(), &JournalWatch::came, [this](const QByteArray &line) {
        m_silence = std::max(m_silence, m_latestLine.restart());
        m_actions->onLine(line);
    });
}

// What the isolation makes in the view to mount something on, for as long as a program runs in it.
ViewFiles RowRun::mountPoints()
{
    const ViewFiles without = viewFiles(m_state);
    Child waiting(m_state.at("world.log"));
    m_world->startProcess(&waiting,
                          {QStringLiteral("sh"), QStringLiteral("-c"), QStringLiteral("echo; read -r end")});
    const bool runs = waiting.waitForReadyRead(kWindowLimitMs);
    ViewFiles points = viewFiles(m_state);
    waiting.closeWriteChannel();
    if (!runs || !waiting.waitForFinished(kWindowLimitMs))
        throw Error(QStringLiteral("nothing can be started in the world"));
    for (auto entry = without.begin(); entry != without.end(); ++entry)
        points.remove(entry.key());
    for (ViewEntry &entry : points)
        entry.isTemporary = true;
    return points;
}

void RowRun::startProgram()
{
    const ProgramStart start = programStart(
        m_isRepaired ? QJsonObject() : json::object(m_row.scenario, "start"), m_program, m_state);
    m_world->startProgram(m_isRepaired ? start.command : m_fault.startOf(start.command), start.isolation);
}

// page, messages: keys of the expectation. A program that ends by itself has nobody at its window.
void RowRun::walk(const QString &journey, const char *page, const char *messages)
{
    if (endsByItself()) {
        serveUntil(kCloseLimitMs, [this] { return m_world->program().state() == QProcess::NotRunning; });
        m_journal->read();
        return;
    }
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
                          writeExpectation(page, messages),
                          QStringLiteral("--state"),
                          m_state.path(),
                          QStringLiteral("--timeout"),
                          QString::number(kWalkLimitS)};
    if (isToEnd())
        arguments += QStringList{QStringLiteral("--stay-after"),
                                 json::text(json::array(m_row.scenario, "actions").first().toObject(), "on")};
    autopilot.start(findTool(QStringLiteral("vesk-autopilot")), arguments);
    const bool hasEnded = serveUntil((kWalkLimitS + 10) * 1000, [&] {
        return autopilot.state() == QProcess::NotRunning ||
               (isToEnd() && m_world->program().state() == QProcess::NotRunning);
    });
    m_journal->read();
    if (isToEnd())
        return;
    if (!hasEnded || autopilot.exitStatus() != QProcess::NormalExit || autopilot.exitCode() != 0)
        complain(QString::fromUtf8(last.isEmpty() ? QByteArray("the autopilot ended without output") : last));
}

// The walk ends with the program; what was in progress in the world is completed.
void RowRun::checkEnd()
{
    static const QMap<QString, int> codes = {{QStringLiteral("killed"), 128 + SIGKILL},
                                             {QStringLiteral("terminated"), 128 + SIGTERM},
                                             {QStringLiteral("display-lost"), 1},
                                             {QStringLiteral("aborted"), 128 + SIGTRAP}};
    const int expected =
        endsByItself() ? json::number(m_expect, "exit", 0) : codes.value(json::text(m_expect, "ends"));
    if (!endsByItself())
        m_complaints += worldchecks::walk(json::text(m_expect, "page"), json::texts(m_expect, "messages"),
                                          m_journal->text());
    if (!serveUntil(kCloseLimitMs, [this] { return m_world->program().state() == QProcess::NotRunning; }))
        complain(QStringLiteral("expected the end of the program, but it is running"));
    else if (m_exitCode != expected)
        complain(QStringLiteral("expected exit code %1, seen %2").arg(expected).arg(m_exitCode));
}

void RowRun::checkWalk()
{
    if (m_row.scenario.contains(QLatin1String("syscall")) && m_silence > kMaxSilenceMs)
        complain(QStringLiteral("nothing happened for %1 ms").arg(m_silence));
    checkCalls(m_journey, callsIn("calls", json::number(m_expect, "incomplete", 0)));
    if (!isToEnd() && m_world->program().state() != QProcess::Running)
        complain(QStringLiteral("the program has ended with exit code %1").arg(m_exitCode));
    checkFiles("files", "settings");
    if (json::flag(json::object(m_row.scenario, "start"), "traced"))
        m_complaints += worldchecks::trace(m_state.starts(), m_rows.journey(m_journey, m_attempts.last()));
    m_complaints += worldchecks::texts("program log", m_state.programLog(), json::texts(m_expect, "log"));
    m_complaints += worldchecks::texts("journal", m_state.journal().path(), json::texts(m_expect, "journal"));
    serveUntil(kSettleLimitMs, [this] {
        m_journal->read();
        return worldchecks::isIdle(m_journal->text());
    });
    m_complaints += worldchecks::world(m_state, json::object(m_expect, "world"));
}

void RowRun::checkCalls(const QString &journey, const ExpectedCalls &expected)
{
    const JourneyPlan plan = m_rows.journey(journey, m_attempts.last());
    const auto differs = [&] {
        m_journal->read();
        return worldchecks::calls(plan, expected, m_journal->text().mid(m_from));
    };
    serveUntil(kSettleLimitMs, [&] { return differs().isEmpty(); });
    m_complaints += differs();
    m_checked = m_journal->text().size();
}

// Nothing is called once the walk has come to its end.
void RowRun::checkSilence()
{
    m_journal->read();
    const QStringList late = worldchecks::calls(m_rows.journey(m_journey, m_attempts.last()), {},
                                                m_journal->text().mid(m_checked));
    for (const QString &complaint : late)
        complain(QStringLiteral("after the walk: %1").arg(complaint));
}

// files, settings: keys of the expectation.
void RowRun::checkFiles(const char *files, const char *settings)
{
    m_complaints += worldchecks::files(m_state, m_before, m_rows, json::text(m_expect, files), m_attempts);
    QStringList lines;
    for (const QString &line : json::texts(m_expect, settings))
        lines.append(m_attempts.last().filled(line));
    m_complaints += worldchecks::settings(m_state, m_settings, lines);
    m_settings = worldchecks::settingsOf(m_state);
}

// A window that may close ends the program normally; one that may not says so in its log.
void RowRun::checkClose()
{
    QFile log(m_state.programLog());
    if (!log.open(QIODevice::ReadOnly) || !log.seek(log.size()))
        complain(QStringLiteral("no program log"));
    m_world->state().journal().write(QStringLiteral("world"), QStringLiteral("the campaign: close"));
    if (windowmanager::askToClose(m_world->environment()) == 0)
        complain(QStringLiteral("no window shows that could be closed"));
    bool isRefused = false;
    const bool isAnswered = serveUntil(kCloseLimitMs, [&] {
        isRefused = isRefused || log.readAll().contains("m_bExit true");
        return isRefused || m_world->program().state() == QProcess::NotRunning;
    });
    if (!isAnswered)
        complain(QStringLiteral("the window neither closes nor refuses to close"));
    else if (isRefused == mayClose())
        complain(isRefused ? QStringLiteral("expected a window that may close, seen a refusal")
                           : QStringLiteral(
                                 "expected a window that refuses to close, seen the end of the program"));
    else if (!isRefused && m_exitCode != 0)
        complain(QStringLiteral("expected exit code 0 after the close, seen %1").arg(m_exitCode));
}

void RowRun::tryNext()
{
    checkSilence();
    const ViewFiles earlier = viewFiles(m_state);
    m_fault.detach();
    obstacles::clear(m_state);
    follow(earlier, viewFiles(m_state), &m_before);
    m_isRepaired = true;
    m_world->repair();
    renew();
    const bool isPressed = m_next == QLatin1String("press");
    if (isPressed)
        hostnames::restore(*m_world); // a new start has a table of its own
    if (m_next == QLatin1String("kill")) {
        // It ends with the isolation around it, but a moment later, and is then forgotten by the reader's
        // bus.
        m_world->program().kill();
        serveUntil(kCloseLimitMs, [this] {
            return m_world->program().state() == QProcess::NotRunning &&
                   !useractions::isAnswering(*m_world, kAskLimitMs);
        });
    }
    m_journal->read();
    m_from = m_journal->text().size();
    m_checked = m_from;
    if (!isPressed)
        startProgram();
    const int complaints = m_complaints.size();
    const QString journey = json::text(m_expect, "next_journey");
    m_attempts.append(Placeholders(m_state, nextScenario(journey)));
    walk(journey, "next_page", "next_messages");
    checkCalls(journey, callsIn("next_calls", 0));
    checkFiles("next_files", "next_settings");
    m_complaints += worldchecks::world(m_state, json::object(m_expect, "next_world"));
    for (int index = complaints; index < m_complaints.size(); ++index)
        m_complaints[index].prepend(QStringLiteral("next attempt: "));
}

// What actions of the row have stopped.
void RowRun::renew()
{
    const QJsonArray actions = json::array(m_row.scenario, "actions");
    for (const QJsonValue &action : actions) {
        const QString what = json::text(action.toObject(), "do");
        if (what == QLatin1String("stop-display"))
            m_world->renewDisplay();
        if (what.endsWith(QLatin1String("-bus")))
            m_world->renewBuses();
    }
}

// What the next attempt types, after the fault is gone.
QJsonObject RowRun::nextScenario(const QString &journey) const
{
    return {{QStringLiteral("journey"), journey},
            {QStringLiteral("input"), json::object(m_row.scenario, "input")}};
}

// key: of the expectation.
ExpectedCalls RowRun::callsIn(const char *key, int incomplete) const
{
    ExpectedCalls calls{{}, incomplete};
    const QJsonObject times = json::object(m_expect, key);
    for (auto call = times.begin(); call != times.end(); ++call)
        calls.times.insert(call.key(), call.value().toInt());
    return calls;
}

QString RowRun::writeExpectation(const char *page, const char *messages)
{
    const QJsonObject expect{{QStringLiteral("page"), m_expect.value(QLatin1String(page))},
                             {QStringLiteral("messages"), json::array(m_expect, messages)}};
    QString path = m_state.at("walk-scenario.json");
    smallfile::saveObject(path, {{QStringLiteral("title"), m_row.id},
                                 {QStringLiteral("input"), json::object(m_row.scenario, "input")},
                                 {QStringLiteral("expect"), expect}});
    return path;
}

// A terminal that has joined knows the ports of the world that it was copied from.
void RowRun::fillPorts()
{
    const QString path = m_state.inside(QStringLiteral("/etc/vesk/userinfo.json"));
    QJsonObject record = smallfile::readObject(path);
    if (!record.value(QLatin1String("is_Domain")).toBool())
        return;
    record.insert(QStringLiteral("domain_port"), QString::number(m_world->enrolmentPort()));
    record.insert(QStringLiteral("server_port"), QString::number(m_world->managedPort()));
    smallfile::saveObject(path, record);
}

} // namespace sandbox
