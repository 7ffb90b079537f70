// SPDX-License-Identifier: Apache-2.0
#include "launcher/launcher.h"

#include "campaign/rows.h"
#include "campaign/worlds.h"
#include "journal/commandline.h"
#include "play/needs.h"
#include "play/preparation.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QStorageInfo>

#include <cstdio>

namespace sandbox {

namespace {

void say(const QString &line)
{
    std::printf("%s\n", qPrintable(line));
    std::fflush(stdout);
}

constexpr char kDescription[] =
    "Starts an enrolment world on this machine and the enrolment program in it.\n"
    "\"vesk-sandbox scenarios\" lists situations that can be played, \"vesk-sandbox rows\"\n"
    "those of the fault campaign, \"vesk-sandbox show ROW\" prints one of them.";

} // namespace

QString LauncherOptions::parse(const QStringList &arguments)
{
    QCommandLineParser parser;
    QString error = commandline::parse(
        parser, arguments, kDescription,
        {{"state", "Directory that keeps the world between runs (default: a temporary one).", "directory"},
         {"scenario", "Situation to play (default: join-ok).", "name or file", "join-ok"},
         {"autopilot", "Let the autopilot work the window: join or leave.", "journey"},
         {"program", "Program to run inside (default: veskw).", "path"},
         {"port", "Port of the enrolment address.", "number"},
         {"screenshots", "Directory for screenshots (default: in the state directory).", "directory"},
         {"headless", "Make a virtual display."},
         {"keep", "Keep the temporary directory."}});
    if (!error.isEmpty())
        return error;
    const QStringList surplus = parser.positionalArguments();
    state = parser.value(QStringLiteral("state"));
    scenario = parser.value(QStringLiteral("scenario"));
    journey = parser.value(QStringLiteral("autopilot"));
    program = parser.value(QStringLiteral("program"));
    screenshots = parser.value(QStringLiteral("screenshots"));
    headless = parser.isSet(QStringLiteral("headless"));
    keep = parser.isSet(QStringLiteral("keep"));
    const QString number = parser.value(QStringLiteral("port"));
    port = number.toUShort();
    if (!surplus.isEmpty())
        return QStringLiteral("unknown argument \"%1\"").arg(surplus.constFirst());
    if (!number.isEmpty() && port == 0)
        return QStringLiteral("--port takes a number from 1 to 65535, not \"%1\"").arg(number);
    if (parser.isSet(QStringLiteral("autopilot")) && journey != QLatin1String("join") &&
        journey != QLatin1String("leave"))
        return QStringLiteral("--autopilot takes join or leave, not \"%1\"").arg(journey);
    return {};
}

Launcher::Launcher(const LauncherOptions &options)
    : m_options(options)
    , m_statePath(options.state)
{
    if (!m_statePath.isEmpty())
        return;
    m_temporary = std::make_unique<QTemporaryDir>(QDir::tempPath() + QStringLiteral("/vesk-world-XXXXXX"));
    m_temporary->setAutoRemove(!options.keep);
    m_statePath = m_temporary->path();
}

int Launcher::run()
{
    QString error;
    connect(&m_signals, &UnixSignals::received, this,
            [](int number) { QCoreApplication::exit(128 + number); });
    bool isReady = check(&error);
    const QString tmp = StateDirectory(m_statePath).inside(QStringLiteral("/tmp"));
    if (isReady && m_smallTmp > 0 && QStorageInfo(tmp).rootPath() != QFileInfo(tmp).canonicalFilePath())
        return needs::runInSmallTmp(tmp, m_smallTmp,
                                    QCoreApplication::arguments().mid(1) +
                                        QStringList{QStringLiteral("--state"), m_statePath});
    isReady = isReady && start(&error);
    if (!isReady) {
        std::fprintf(stderr, "vesk-sandbox: %s\n", qPrintable(error));
        m_world.reset();
        return 1;
    }
    const int exitCode = QCoreApplication::exec();
    m_autopilot.reset();
    m_journal.reset();
    m_world.reset();
    if (!m_temporary || !m_temporary->autoRemove())
        say(QStringLiteral("left in   %1").arg(m_statePath));
    return exitCode;
}

// Checked before anything is created.
bool Launcher::check(QString *error)
{
    if (m_temporary && !m_temporary->isValid())
        *error = QStringLiteral("cannot create a temporary directory: %1").arg(m_temporary->errorString());
    else if (!m_options.headless && qEnvironmentVariableIsEmpty("DISPLAY"))
        *error = QStringLiteral("no display: use --headless, and --autopilot join to have the window worked");
    else if (m_options.program.isEmpty())
        m_options.program = findTool(QStringLiteral("veskw"), error);
    else if (!QFileInfo(m_options.program).isExecutable())
        *error = QStringLiteral("%1 is not executable").arg(m_options.program);
    return error->isEmpty() && findScenario(error);
}

// A row becomes a file, as the scenarios are that lie there.
bool Launcher::findScenario(QString *error)
{
    m_scenarioFile = Scenario::pathOf(m_options.scenario);
    if (!m_scenarioFile.isEmpty())
        return Scenario::load(m_scenarioFile, error).has_value();
    const auto rows = Rows::load(error);
    const auto row = rows ? rows->find(m_options.scenario) : std::nullopt;
    if (rows && !row)
        *error = QStringLiteral(
                     "no scenario \"%1\"; \"vesk-sandbox scenarios\" and \"vesk-sandbox rows\" list them")
                     .arg(m_options.scenario);
    if (!row)
        return false;
    *error = needs::lacking(json::texts(row->scenario, "needs"));
    if (!error->isEmpty() || !m_rowFile.open() || !makeWorldFor(row->scenario, error))
        return false;
    m_scenarioFile = m_rowFile.fileName();
    m_smallTmp = json::number(json::object(row->scenario, "start"), "small_tmp", 0);
    return writeScenario(StateDirectory(m_statePath), row->scenario, m_scenarioFile, error);
}

// A row about leaving finds a terminal that has joined; others find a world that has run once, so that there
// is a CA to quote and a /tmp to mount.
bool Launcher::makeWorldFor(const QJsonObject &scenario, QString *error)
{
    if (!QDir(m_statePath).isEmpty())
        return true;
    if (QStringList{QStringLiteral("leave"), QStringLiteral("status")}.contains(
            json::text(scenario, "journey")))
        return worlds::makeJoined(m_statePath, error);
    return worlds::makeNew(m_statePath, error);
}

bool Launcher::start(QString *error)
{
    WorldOptions options;
    options.state = m_statePath;
    options.scenarioFile = m_scenarioFile;
    options.port = m_options.port;
    options.virtualDisplay = m_options.headless;
    options.accessible = !m_options.journey.isEmpty();
    m_world = std::make_unique<World>(options);
    connect(m_world.get(), &World::rebootAsked, this, &Launcher::onReboot);
    connect(m_world.get(), &World::programEnded, this, &Launcher::onProgramEnded);
    if (!m_world->start(error))
        return false;
    printWhatToType();
    return startProgram(error) && (m_options.journey.isEmpty() || startAutopilot(error));
}

bool Launcher::startProgram(QString *error)
{
    const QJsonObject scenario = m_world->scenario().json();
    const ProgramStart start = programStart(
        json::object(scenario, "start"), QFileInfo(m_options.program).absoluteFilePath(), m_world->state());
    m_fault = std::make_unique<SyscallFault>(m_world->state(), json::object(scenario, "syscall"));
    if (!prepareFiles(m_world->state(), json::object(scenario, "prepare"), error))
        return false;
    m_actions = std::make_unique<Actions>(*m_world, json::array(scenario, "actions"), *m_fault, nullptr);
    m_journal = std::make_unique<JournalWatch>(m_world->state().journal().path());
    connect(m_journal.get(), &JournalWatch::came, this,
            [this](const QByteArray &line) { m_actions->onLine(line); });
    return m_world->startProgram(m_fault->startOf(start.command), error, start.isolation);
}

bool Launcher::startAutopilot(QString *error)
{
    const QString program = findTool(QStringLiteral("vesk-autopilot"), error);
    if (program.isEmpty())
        return false;
    const StateDirectory &state = m_world->state();
    m_autopilot = std::make_unique<Child>(state.at("world.log"));
    m_autopilot->setProcessChannelMode(QProcess::ForwardedChannels);
    connect(m_autopilot.get(), qOverload<int, QProcess::ExitStatus>(&QProcess::finished), this,
            &Launcher::onAutopilotEnded);
    const QString path = m_options.screenshots.isEmpty() ? state.at("screenshots") : m_options.screenshots;
    return m_autopilot->startIn(m_world->environment(), program,
                                {m_options.journey, QStringLiteral("--program"), World::programName(),
                                 QStringLiteral("--scenario"), state.scenarioFile(),
                                 QStringLiteral("--state"), state.path(), QStringLiteral("--screenshots"),
                                 QFileInfo(path).absoluteFilePath()},
                                error);
}

void Launcher::printWhatToType() const
{
    const ScenarioInput input = m_world->scenario().input();
    const QString port = input.port.isEmpty() ? QString::number(m_world->enrolmentPort()) : input.port;
    say(QStringLiteral("scenario  %1").arg(m_world->scenario().title()));
    say(QStringLiteral("server    %1, port %2").arg(input.host, port));
    say(QStringLiteral("account   %1, password %2").arg(input.user, input.password));
    say(QStringLiteral("leaving   administrator %1, password %2")
            .arg(input.administrator, input.administratorPassword));
    say(QStringLiteral("journal   %1").arg(m_world->state().journal().path()));
}

void Launcher::onReboot()
{
    say(QStringLiteral("the terminal asked for a reboot: the run ends"));
    m_world->reboot();
    if (!m_autopilot)
        QCoreApplication::exit(0);
}

void Launcher::onProgramEnded(int exitCode)
{
    if (!m_autopilot)
        QCoreApplication::exit(exitCode);
}

// The autopilot sees for itself when the program is gone, and says so.
void Launcher::onAutopilotEnded(int exitCode, QProcess::ExitStatus status)
{
    QCoreApplication::exit(status == QProcess::NormalExit ? exitCode : 1);
}

} // namespace sandbox
