// SPDX-License-Identifier: Apache-2.0
#include "server/managementserver.h"

#include "server/dispatcher.h"
#include "server/network.h"
#include "server/pkidirectory.h"

#include <QDir>
#include <QFile>

namespace sandbox {

namespace {

// Directories above the last one take the usual mode, the last one is its owner's only.
bool makeDirectory(const QString &path, QString *error)
{
    const auto ownersOnly = QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner;
    const bool made = QDir(path).exists() || (QDir().mkpath(path) && QFile::setPermissions(path, ownersOnly));
    if (!made)
        *error = QStringLiteral("%1: cannot be created").arg(path);
    return made;
}

QStringList serverNames(const Domain &domain)
{
    QStringList names = {QStringLiteral("localhost"), QStringLiteral("127.0.0.1"), QStringLiteral("::1"),
                         domain.text("host")};
    names += domain.texts("host_names");
    names.removeDuplicates();
    return names;
}

} // namespace

// What exists while the server runs. The network is the last member, so its thread ends before all else does.
class ManagementServer::Running
{
public:
    Running(Domain found, const QString &directory, PkiDirectory certificates, const Scenario &scenario,
            const Journal &journal)
        : pki(std::move(certificates))
        , domain(std::move(found))
        , endpoints(domain, pki.authority, QDir(directory).filePath(QStringLiteral("issued")))
        , dispatcher(domain, endpoints, scenario, journal)
        , network(dispatcher)
    {
    }

    PkiDirectory pki;
    Domain domain;
    Endpoints endpoints;
    Dispatcher dispatcher;
    Network network;
};

ManagementServer::ManagementServer(QString stateDirectory, const Scenario &scenario, const Journal &journal)
    : m_state(std::move(stateDirectory))
    , m_scenario(scenario)
    , m_journal(journal)
{
}

ManagementServer::~ManagementServer() = default;

bool ManagementServer::start(QString *error)
{
    auto running = prepared(error);
    if (!running || !openListeners(*running, error))
        return false;
    if (!running->domain.keepPorts(m_enrolmentPort, m_managedPort, error))
        return false;
    running->network.run();
    m_running = std::move(running);
    return true;
}

void ManagementServer::repair()
{
    m_running->network.repair();
}

void ManagementServer::dropConnections()
{
    m_running->network.dropConnections();
}

std::unique_ptr<ManagementServer::Running> ManagementServer::prepared(QString *error) const
{
    const QDir directory(m_state);
    if (!makeDirectory(m_state, error) || !makeDirectory(directory.filePath(QStringLiteral("issued")), error))
        return nullptr;
    auto domain =
        Domain::open(directory.filePath(QStringLiteral("config.json")), m_scenario.serverConfig(), error);
    auto pki = domain ? PkiDirectory::open(m_state, serverNames(*domain), error) : std::nullopt;
    if (!pki)
        return nullptr;
    return std::make_unique<Running>(std::move(*domain), m_state, std::move(*pki), m_scenario, m_journal);
}

bool ManagementServer::openListeners(Running &running, QString *error)
{
    const Domain &domain = running.domain;
    ListenerPlan managed;
    managed.connections = m_scenario.serverConnections();
    const auto faulty = running.pki.faulty(managed.connections.fault, serverNames(domain), error);
    if (!faulty)
        return false;
    managed.faultyCredentials = *faulty;
    ListenerPlan enrolment = managed;
    enrolment.port = m_wantedPort != 0 ? m_wantedPort : static_cast<quint16>(domain.number("enrolment_port"));
    enrolment.credentials = running.pki.enrolment;
    managed.kind = Listener::Managed;
    managed.port = static_cast<quint16>(domain.number("managed_port"));
    managed.credentials = running.pki.managed;
    managed.clientCaPem = running.pki.authority.certificatePem();

    m_enrolmentPort = running.network.open(enrolment, error);
    m_managedPort = m_enrolmentPort == 0 ? 0 : running.network.open(managed, error);
    return m_managedPort != 0;
}

} // namespace sandbox
