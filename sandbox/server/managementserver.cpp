// SPDX-License-Identifier: Apache-2.0
#include "server/managementserver.h"

#include "journal/error.h"
#include "server/network.h"
#include "server/pkidirectory.h"

#include <QDir>

namespace sandbox {

namespace {

// Directories above the last one take the usual mode, the last one is its owner's only.
QString made(const QString &path)
{
    const auto ownersOnly = QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner;
    if (!QDir(path).exists() && !(QDir().mkpath(path) && QFile::setPermissions(path, ownersOnly)))
        throw Error(QStringLiteral("%1: cannot be created").arg(path));
    return path;
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

// The network is the last member, so its threads end before all else does.
class ManagementServer::Parts
{
public:
    Parts(const QString &directory, const Scenario &scenario, const Journal &journal)
        : domain(made(directory) + QStringLiteral("/config.json"), scenario.serverConfig())
        , pki(directory, serverNames(domain))
        , endpoints(domain, pki.authority, made(directory + QStringLiteral("/issued")))
        , dispatcher(domain, endpoints, scenario, journal)
        , network(dispatcher)
    {
    }

    Domain domain;
    PkiDirectory pki;
    Endpoints endpoints;
    Dispatcher dispatcher;
    Network network;
};

ManagementServer::ManagementServer(const QString &stateDirectory, const Scenario &scenario,
                                   const Journal &journal, quint16 enrolmentPort)
    : m_parts(std::make_unique<Parts>(stateDirectory, scenario, journal))
{
    Domain &domain = m_parts->domain;
    const PkiDirectory &pki = m_parts->pki;
    ListenerPlan managed;
    managed.connections = scenario.serverConnections();
    managed.faultyCredentials = pki.faulty(managed.connections.fault, serverNames(domain));
    ListenerPlan enrolment = managed;
    enrolment.port =
        enrolmentPort != 0 ? enrolmentPort : static_cast<quint16>(domain.number("enrolment_port"));
    enrolment.credentials = pki.enrolment;
    managed.kind = Listener::Managed;
    managed.port = static_cast<quint16>(domain.number("managed_port"));
    managed.credentials = pki.managed;
    managed.clientCaPem = pki.authority.certificatePem();

    m_enrolmentPort = m_parts->network.open(enrolment);
    m_managedPort = m_parts->network.open(managed);
    domain.keepPorts(m_enrolmentPort, m_managedPort);
    m_parts->network.run();
}

ManagementServer::~ManagementServer() = default;

void ManagementServer::repair()
{
    m_parts->network.repair();
}

void ManagementServer::dropConnections()
{
    m_parts->network.dropConnections();
}

} // namespace sandbox
