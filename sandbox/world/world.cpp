// SPDX-License-Identifier: Apache-2.0
#include "world.h"

#include "journal/error.h"
#include "server/managementserver.h"
#include "services/servicehost.h"
#include "worldfiles.h"

#include <QDir>
#include <QFileInfo>
#include <QTextCodec>

namespace sandbox {

namespace {

const QString kNowhere = QStringLiteral("unix:path=/nonexistent");

// HOME changes inside, and with it the place where X clients look for their cookie.
void keepAuthority(QProcessEnvironment *environment)
{
    const QString name = QStringLiteral("XAUTHORITY");
    const QString usual = QDir::homePath() + QStringLiteral("/.Xauthority");
    if (!environment->contains(name) && QFileInfo::exists(usual))
        environment->insert(name, usual);
}

// The world's server is on this machine; a proxy of the user's network would look for it on its own.
QProcessEnvironment withoutProxies(QProcessEnvironment environment)
{
    for (const char *variable : {"http_proxy", "https_proxy", "HTTPS_PROXY", "all_proxy", "ALL_PROXY"})
        environment.remove(QLatin1String(variable));
    return environment;
}

} // namespace

World::World(const WorldOptions &options)
    : m_options(options)
    , m_state(QFileInfo(options.state).absoluteFilePath())
    , m_lock(m_state.at("lock"))
    , m_runtime(m_state)
    , m_sessionBus(QStringLiteral("session"), QStringLiteral("session-bus"), m_state)
    , m_systemBus(QStringLiteral("system"), QStringLiteral("system-bus"), m_state)
    , m_readerBus(QStringLiteral("session"), QStringLiteral("reader-bus"), m_state)
    , m_display(m_state)
    , m_accessibility(m_state.at("world.log"))
    , m_userServices(m_state)
    , m_program(m_state.programLog())
{
    m_lock.setStaleLockTime(0);
    m_program.setStandardOutputFile(m_state.programLog(), QIODevice::Append);
    connect(&m_program, qOverload<int, QProcess::ExitStatus>(&QProcess::finished), this, &World::reportEnd);
}

World::~World()
{
    stop();
}

void World::start()
{
    try {
        prepareFiles();
        m_running = true;
        startParts();
    } catch (const Error &) {
        stop();
        m_lock.unlock();
        throw;
    }
    m_state.journal().write(QStringLiteral("world"),
                            QStringLiteral("started, enrolment port %1, scenario \"%2\"")
                                .arg(enrolmentPort())
                                .arg(m_scenario.title()));
}

void World::stop()
{
    if (!m_running)
        return;
    m_running = false;
    m_program.end();
    m_userServices.stop();
    m_accessibility.stop();
    m_readerBus.stop();
    m_display.stop();
    stopServices();
    m_systemBus.stop();
    m_sessionBus.stop();
    m_server.reset();
    m_hold.reset();
    m_runtime.remove();
    m_state.journal().write(QStringLiteral("world"), QStringLiteral("stopped"));
    m_lock.unlock();
}

void World::prepareFiles()
{
    m_scenario = Scenario::load(m_options.scenarioFile);
    WorldFiles::refuseUnusable(m_state.path());
    if (!QDir().mkpath(m_state.path()))
        throw Error(QStringLiteral("cannot create the directory %1").arg(m_state.path()));
    if (!m_lock.tryLock())
        throw Error(QStringLiteral("another world runs in %1").arg(m_state.path()));
    WorldFiles(m_state, m_options.scenarioFile).prepare(m_scenario);
    m_runtime.make();
}

void World::startParts()
{
    m_hold.emplace(m_state.journal());
    if (!m_hold->create())
        throw Error(QStringLiteral("cannot create a pipe in %1").arg(m_state.path()));
    m_server = std::make_unique<ManagementServer>(m_state.at("server"), m_scenario, m_state.journal(),
                                                  m_options.port);
    startBuses();
    startServices();
    m_userServices.start(environment());
    if (m_options.virtualDisplay)
        m_display.start();
    if (m_options.accessible)
        startAccessibility();
}

void World::startBuses()
{
    const auto namesOn = [this](bool isSystem, const char *flag) {
        QStringList names;
        for (const servicehost::Entry &service : servicehost::all()) {
            if (service.isOnSystemBus == isSystem && json::flag(m_scenario.service(service.name), flag))
                names.append(service.busName);
        }
        return names;
    };
    for (const bool isSystem : {false, true}) {
        BusDaemon &bus = isSystem ? m_systemBus : m_sessionBus;
        bus.deny(namesOn(isSystem, "denied"));
        bus.failActivation(namesOn(isSystem, "activation_fails"));
        bus.startRecorded();
    }
}

void World::startAccessibility()
{
    if (m_options.separateReaderBus)
        m_readerBus.start();
    m_accessibility.start(readerEnvironment());
}

void World::startServices()
{
    for (const servicehost::Entry &service : servicehost::all()) {
        const QJsonObject script = m_scenario.service(service.name);
        if (json::flag(script, "present", true) && !json::flag(script, "activation_fails"))
            startService(service.name);
    }
}

void World::startService(const QString &name)
{
    const QString program = findTool(QStringLiteral("vesk-sandbox"));
    Child *process = m_services.emplace_back(std::make_unique<Child>(m_state.at("world.log"))).get();
    process->setObjectName(name);
    process->setProcessEnvironment(environment());
    const QString said = process->startAndReadLine(
        program, {QStringLiteral("service"), name, QStringLiteral("--state"), m_state.path()});
    if (said != QLatin1String(servicehost::kReady))
        throw Error(QStringLiteral("service %1: %2").arg(name, said));
    connect(process, &QProcess::readyReadStandardOutput, this, [this, process] {
        while (process->canReadLine()) {
            if (process->readLine().trimmed() == servicehost::kReboot)
                Q_EMIT rebootAsked();
        }
    });
    connect(process, qOverload<int, QProcess::ExitStatus>(&QProcess::finished), this,
            [this, name] { followService(name); });
}

// Those that end now do not end by themselves.
void World::stopServices(const QString &name)
{
    for (const auto &service : m_services) {
        if (name.isEmpty() || service->objectName() == name) {
            service->disconnect(this);
            service->end();
        }
    }
    if (name.isEmpty())
        m_services.clear();
}

void World::followService(const QString &name)
{
    m_state.journal().write(QStringLiteral("world"), QStringLiteral("service %1 has ended").arg(name));
    const QJsonObject script = m_scenario.service(name);
    bool restarts = json::flag(script, "restarts");
    for (const QJsonValue &operation : json::object(script, "operations"))
        restarts = restarts || json::flag(operation.toObject(), "restarts");
    QString error;
    if (restarts && !attempt(&error, [&] { startService(name); }))
        m_state.journal().write(QStringLiteral("world"), error);
}

void World::repair()
{
    const Scenario before = std::exchange(m_scenario, Scenario());
    WorldFiles(m_state, m_options.scenarioFile).forgetScenario();
    m_server->repair();
    QStringList affected;
    for (const servicehost::Entry &service : servicehost::all()) {
        const BusDaemon &bus = service.isOnSystemBus ? m_systemBus : m_sessionBus;
        if (!before.service(service.name).isEmpty() || !bus.isRunning())
            affected.append(service.name);
    }
    for (BusDaemon *bus : {&m_sessionBus, &m_systemBus}) {
        if (bus->isRunning())
            bus->allowAll();
        else
            bus->startRecorded();
    }
    for (const QString &name : affected) {
        stopServices(name);
        startService(name);
    }
    m_state.journal().write(QStringLiteral("world"), QStringLiteral("repaired"));
}

void World::dropConnections()
{
    m_server->dropConnections();
}

// What publishes the windows needs a display of its own.
void World::renewDisplay()
{
    m_accessibility.stop();
    m_readerBus.stop();
    m_display.stop();
    m_display.start();
    if (m_options.accessible)
        startAccessibility();
}

void World::renewBuses()
{
    stopServices();
    m_sessionBus.stop();
    m_systemBus.stop();
    startBuses();
    startServices();
}

void World::startProgram(const QStringList &command, const QStringList &isolation)
{
    startProcess(&m_program, command, isolation);
}

void World::startProcess(Child *child, const QStringList &command, const QStringList &furtherOptions)
{
    QStringList arguments{QStringLiteral("--root"),     m_state.root(),
                          QStringLiteral("--writable"), m_state.path(),
                          QStringLiteral("--writable"), m_state.run()};
    const QString resolver = m_state.inside(QStringLiteral("/etc/resolv.conf"));
    if (QFileInfo::exists(resolver))
        arguments << QStringLiteral("--bind") << resolver + QStringLiteral(":/etc/resolv.conf");
    arguments += furtherOptions;
    const auto pass = [&](const char *variable, const QString &value) {
        arguments << QStringLiteral("--setenv") << QLatin1String(variable) + QLatin1Char('=') + value;
    };
    const auto passBus = [&](const char *variable, const char *name, const BusDaemon &bus) {
        pass(variable, m_scenario.hasBus(name) ? bus.address() : kNowhere);
    };
    passBus("DBUS_SESSION_BUS_ADDRESS", "session", m_sessionBus);
    passBus("DBUS_SYSTEM_BUS_ADDRESS", "system", m_systemBus);
    if (m_options.separateReaderBus)
        pass("AT_SPI_BUS_ADDRESS", m_accessibility.address());
    QProcessEnvironment environment = withoutProxies(this->environment());
    // Scratch space of the isolation, not of the program.
    environment.insert(QStringLiteral("TMPDIR"), m_state.run());
    child->startIn(environment, findTool(QStringLiteral("vesk-isolate")),
                   arguments + QStringList{QStringLiteral("--")} + command);
}

void World::reboot()
{
    m_program.end();
    WorldFiles(m_state, m_options.scenarioFile).emptyTmp();
}

void World::reportEnd(int exitCode)
{
    if (!m_running)
        return;
    m_state.journal().write(QStringLiteral("world"),
                            QStringLiteral("the program has ended with exit code %1").arg(exitCode));
    Q_EMIT programEnded(exitCode);
}

QString World::programName()
{
    return QStringLiteral("维斯克平台");
}

quint16 World::enrolmentPort() const
{
    return m_server ? m_server->enrolmentPort() : 0;
}

quint16 World::managedPort() const
{
    return m_server ? m_server->managedPort() : 0;
}

QProcessEnvironment World::environment() const
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    const auto set = [&environment](const char *name, const QString &value) {
        environment.insert(QLatin1String(name), value);
    };
    keepAuthority(&environment);
    set(StateDirectory::kVariable, m_state.path());
    set("HOME", m_state.home());
    set("XDG_CONFIG_HOME", m_state.home() + QStringLiteral("/.config"));
    set("XDG_CACHE_HOME", m_state.home() + QStringLiteral("/.cache"));
    set("XDG_DATA_HOME", m_state.home() + QStringLiteral("/.local/share"));
    set("XDG_RUNTIME_DIR", m_state.run());
    set("DBUS_SESSION_BUS_ADDRESS", m_sessionBus.address());
    set("DBUS_SYSTEM_BUS_ADDRESS", m_systemBus.address());
    set("GSETTINGS_BACKEND", QStringLiteral("keyfile"));
    set("GSETTINGS_SCHEMA_DIR", m_state.schemas());
    set("PATH", m_state.commands() + QLatin1Char(':') + qEnvironmentVariable("PATH"));
    set("QT_QPA_PLATFORM", QStringLiteral("xcb"));
    if (m_options.virtualDisplay) {
        set("DISPLAY", m_display.name());
        set("XAUTHORITY", m_display.authority());
    }
    if (QTextCodec::codecForLocale()->name() != "UTF-8")
        set("LC_ALL", QStringLiteral("C.UTF-8"));
    return environment;
}

QProcessEnvironment World::readerEnvironment() const
{
    QProcessEnvironment environment = this->environment();
    if (m_options.separateReaderBus)
        environment.insert(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"), m_readerBus.address());
    return environment;
}

} // namespace sandbox
