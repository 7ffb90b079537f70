// SPDX-License-Identifier: Apache-2.0
#include "server/domain.h"

#include <algorithm>

namespace sandbox {

namespace {

constexpr int kPermitSeconds = 600;

template <typename T, typename Test>
const T *find(const QVector<T> &list, Test test)
{
    const auto found = std::find_if(list.begin(), list.end(), test);
    return found == list.end() ? nullptr : &*found;
}

} // namespace

Domain::Domain(ServerConfig config, QString configPath)
    : m_config(std::move(config))
    , m_configPath(std::move(configPath))
{
}

const Account *Domain::account(const QString &name) const
{
    return find(m_config.accounts, [&](const Account &account) { return account.name == name; });
}

const Account *Domain::administrator(const QString &name) const
{
    return find(m_config.administrators, [&](const Account &account) { return account.name == name; });
}

const Department *Domain::department(const QString &id) const
{
    return find(m_config.departments, [&](const Department &department) { return department.id == id; });
}

const Terminal *Domain::terminal(const QString &machineId) const
{
    return find(m_config.knownTerminals,
                [&](const Terminal &terminal) { return terminal.machineId == machineId; });
}

bool Domain::isFull() const
{
    return m_config.knownTerminals.size() >= m_config.terminalLimit;
}

bool Domain::isNameTaken(const QString &terminalName) const
{
    return find(m_config.knownTerminals,
                [&](const Terminal &terminal) { return terminal.name == terminalName; }) != nullptr;
}

bool Domain::isRevoked(const QString &certificateSerial) const
{
    return find(m_config.revokedCertificates, [&](const RevokedCertificate &revoked) {
               return revoked.serial == certificateSerial;
           }) != nullptr;
}

bool Domain::keepPorts(int enrolmentPort, int managedPort, QString *error)
{
    ServerConfig changed = m_config;
    changed.enrolmentPort = enrolmentPort;
    changed.managedPort = managedPort;
    return replace(changed, error);
}

bool Domain::add(const Terminal &terminal, QString *error)
{
    ServerConfig changed = m_config;
    changed.knownTerminals += terminal;
    return replace(changed, error);
}

bool Domain::remove(const QString &machineId, QString *error)
{
    ServerConfig changed = m_config;
    for (const Terminal &terminal : std::as_const(m_config.knownTerminals)) {
        if (terminal.machineId == machineId && !terminal.certificateSerial.isEmpty())
            changed.revokedCertificates += {terminal.certificateSerial, machineId, timeStamp()};
    }
    const auto gone =
        std::remove_if(changed.knownTerminals.begin(), changed.knownTerminals.end(),
                       [&](const Terminal &terminal) { return terminal.machineId == machineId; });
    changed.knownTerminals.erase(gone, changed.knownTerminals.end());
    if (!replace(changed, error))
        return false;
    m_permits.remove(machineId);
    return true;
}

void Domain::allowRemoval(const QString &machineId, const QString &administrator)
{
    m_permits.insert(machineId, {administrator, QDateTime::currentDateTimeUtc().addSecs(kPermitSeconds)});
}

bool Domain::mayRemove(const QString &machineId, const QString &administrator) const
{
    const auto permit = m_permits.constFind(machineId);
    return permit != m_permits.constEnd() && permit->administrator == administrator &&
           QDateTime::currentDateTimeUtc() < permit->until;
}

bool Domain::replace(const ServerConfig &config, QString *error)
{
    if (!config.save(m_configPath, error))
        return false;
    m_config = config;
    return true;
}

QString timeStamp()
{
    return QDateTime::currentDateTimeUtc().toString(Qt::ISODate);
}

} // namespace sandbox
