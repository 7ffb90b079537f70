// SPDX-License-Identifier: Apache-2.0
#include "launcher/launcher.h"

#include "campaign/rows.h"
#include "campaign/worlds.h"
#include "journal/commandline.h"
#include "journal/error.h"
#include "play/needs.h"
#include "play/preparation.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QStorageInfo>

#include <csignal>
#include <cstdio>

#include <glib-unix.h>

namespace sandbox {

namespace {

using commandline::say;

// Qt's event loop is GLib's, which serves signals.
gboolean leave(gpointer number)
{
    QCoreApplication::exit(128 + GPOINTER_TO_INT(number));
    return G_SOURCE_CONTINUE;
}

constexpr char kDescription[] =
    "Starts an enrolment world on this machine and the enrolment program in it.\n"
    "\"vesk-sandbox scenarios\" lists situations that can be played, \"vesk-sandbox rows\"\n"
    "those of the fault campaign, \"vesk-sandbox show ROW\" prints one of them.";

} // namespace

QString Launcher::parse(QCommandLineParser &parser, const QStringList &arguments)
{
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
    const QString port = parser.value(QStringLiteral("port"));
    const QString journey = parser.value(QStringLiteral("autopilot"));
    if (!parser.positionalArguments().isEmpty())
        return QStringLiteral("unknown argument \"%1\"").arg(parser.positionalArguments().constFirst());
    if (!port.isEmpty() && port.toUShort() == 0)
        return QStringLiteral("--port takes a number from 1 to 65535, not \"%1\"").arg(port);
    if (parser.isSet(QStringLiteral("autopilot")) && journey != QLatin1String("join") &&
        journey != QLatin1String("leave"))
        return QStringLiteral("--autopilot takes join or leave, not \"%1\"").arg(journey);
    return {};
}

Launcher::Launcher(const QCommandLineParser &options)
    : m_options(options)
    , m_program(option("program"))
    , m_statePath(option("state"))
{
    if (!m_statePath.isEmpty())
        return;
    m_temporary = std::make_unique<QTemporaryDir>(QDir::tempPath() + QStringLiteral("/vesk-world-XXXXXX"));
    m_temporary->setAutoRemove(!options.isSet(QStringLiteral("keep")));
    m_statePath = m_temporary->path();
}

int Launcher::run()
{
    for (const int number : {SIGTERM, SIGINT, SIGHUP})
        g_unix_signal_add(number, leave, GINT_TO_POINTER(number));
    QString error;
    int exitCode = 0;
    const auto begin = [&] {
        check();
        findScenario();
        const QString tmp = StateDirectory(m_statePath).inside(QStringLiteral("/tmp"));
        if (m_smallTmp > 0 && QStorageInfo(tmp).rootPath() != QFileInfo(tmp).canonicalFilePath())
            exitCode = needs::runInSmallTmp(tmp, m_smallTmp,
                                            QCoreApplication::arguments().mid(1) +
                                                QStringList{QStringLiteral("--state"), m_statePath});
        else
            start();
    };
    if (!attempt(&error, begin)) {
        m_world.reset();
        return commandline::fail(error, 1);
    }
    if (!m_world)
        return exitCode;
    exitCode = QCoreApplication::exec();
    m_autopilot.reset();
    m_journal.reset();
    m_world.reset();
    if (!m_temporary || !m_temporary->autoRemove())
        say(QStringLiteral("left in   %1").arg(m_statePath));
    return exitCode;
}

// Before anything is created.
void Launcher::check()
{
    if (m_temporary && !m_temporary->isValid())
        throw Error(
            QStringLiteral("cannot create a temporary directory: %1").arg(m_temporary->errorString()));
    if (!m_options.isSet(QStringLiteral("headless")) && qEnvironmentVariableIsEmpty("DISPLAY"))
        throw Error(
            QStringLiteral("no display: use --headless, and --autopilot join to have the window worked"));
    if (m_program.isEmpty())
        m_program = findTool(QStringLiteral("veskw"));
    else if (!QFileInfo(m_program).isExecutable())
        throw Error(QStringLiteral("%1 is not executable").arg(m_program));
}

// A row becomes a file, as the scenarios are that lie there.
void Launcher::findScenario()
{
    m_scenarioFile = Scenario::pathOf(option("scenario"));
    if (!m_scenarioFile.isEmpty()) {
        Scenario::load(m_scenarioFile); // throws before anything is made
        return;
    }
    const auto row = Rows::load().find(option("scenario"));
    if (!row)
        throw Error(QStringLiteral(
                        "no scenario \"%1\"; \"vesk-sandbox scenarios\" and \"vesk-sandbox rows\" list them")
                        .arg(option("scenario")));
    if (const QString lack = needs::lacking(json::texts(row->scenario, "needs")); !lack.isEmpty())
        throw Error(lack);
    if (!m_rowFile.open())
        throw Error(m_rowFile.errorString());
    // A row about leaving finds a terminal that has joined; others find a world that has run once, so that
    // there is a CA to quote and a /tmp to mount.
    if (QDir(m_statePath).isEmpty())
        worlds::make(worlds::nameFor(json::text(row->scenario, "journey")), m_statePath);
    m_scenarioFile = m_rowFile.fileName();
    m_smallTmp = json::number(json::object(row->scenario, "start"), "small_tmp", 0);
    writeScenario(StateDirectory(m_statePath), row->scenario, m_scenarioFile);
}

void Launcher::start()
{
    WorldOptions options;
    options.state = m_statePath;
    options.scenarioFile = m_scenarioFile;
    options.port = option("port").toUShort();
    options.virtualDisplay = m_options.isSet(QStringLiteral("headless"));
    options.accessible = !journey().isEmpty();
    m_world = std::make_unique<World>(options);
    connect(m_world.get(), &World::rebootAsked, this, &Launcher::onReboot);
    connect(m_world.get(), &World::programEnded, this, &Launcher::onProgramEnded);
    m_world->start();
    printWhatToType();
    startProgram();
    if (!journey().isEmpty())
        startAutopilot();
}

void Launcher::startProgram()
{
    const QJsonObject scenario = m_world->scenario().json();
    const ProgramStart start = programStart(json::object(scenario, "start"),
                                            QFileInfo(m_program).absoluteFilePath(), m_world->state());
    m_fault = std::make_unique<SyscallFault>(m_world->state(), json::object(scenario, "syscall"));
    prepareFiles(m_world->state(), json::object(scenario, "prepare"));
    m_actions = std::make_unique<Actions>(*m_world, json::array(scenario, "actions"), *m_fault, nullptr);
    m_journal = std::make_unique<JournalWatch>(m_world->state().journal().path());
    connect(m_journal.get(), &JournalWatch::came, this,
            [this](const QByteArray &line) { m_actions->onLine(line); });
    m_world->startProgram(m_fault->startOf(start.command), start.isolation);
}

void Launcher::startAutopilot()
{
    const StateDirectory &state = m_world->state();
    m_autopilot = std::make_unique<Child>(state.at("world.log"));
    m_autopilot->setProcessChannelMode(QProcess::ForwardedChannels);
    // The autopilot sees for itself when the program is gone, and says so.
    connect(m_autopilot.get(), qOverload<int, QProcess::ExitStatus>(&QProcess::finished), this,
            [](int exitCode, QProcess::ExitStatus status) {
                QCoreApplication::exit(status == QProcess::NormalExit ? exitCode : 1);
            });
    const QString path = option("screenshots").isEmpty() ? state.at("screenshots") : option("screenshots");
    const QStringList arguments = QStringList(journey())
                                  << QStringLiteral("--program") << World::programName()
                                  << QStringLiteral("--scenario") << state.scenarioFile()
                                  << QStringLiteral("--state") << state.path()
                                  << QStringLiteral("--screenshots") << QFileInfo(path).absoluteFilePath();
    m_autopilot->startIn(m_world->environment(), findTool(QStringLiteral("vesk-autopilot")), arguments);
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

} // namespace sandbox
