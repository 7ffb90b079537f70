// SPDX-License-Identifier: Apache-2.0
#include "server/domain.h"

#include "data/data.h"
#include "journal/error.h"
#include "journal/smallfile.h"
#include "scenario/json.h"
#include "scenario/schemacheck.h"

#include <QDateTime>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>

namespace sandbox {

namespace {

const QString kDefinition = QStringLiteral("serverConfig");

QString timeStamp()
{
    return QDateTime::currentDateTimeUtc().toString(Qt::ISODate);
}

void append(QJsonObject &config, const char *list, const QJsonObject &element)
{
    QJsonArray elements = config.value(QLatin1String(list)).toArray();
    elements.append(element);
    config.insert(QLatin1String(list), elements);
}

} // namespace

Domain::Domain(const QString &path, const QJsonObject &ofNew)
    : m_path(path)
{
    QJsonObject given = ofNew;
    if (QFile::exists(path))
        given = schemacheck::read(path, kDefinition);
    else if (const QString complaint = schemacheck::complaint(ofNew, kDefinition); !complaint.isEmpty())
        throw Error(QStringLiteral("configuration of a new server: %1").arg(complaint));
    const QJsonObject standard = QJsonDocument::fromJson(data::read("server-config.json")).object();
    m_config = json::overlaid(standard, given);
}

bool Domain::isFull() const
{
    return m_config.value(QLatin1String("known_terminals")).toArray().size() >= number("terminal_limit");
}

void Domain::keepPorts(int enrolmentPort, int managedPort)
{
    const QJsonObject ports{{QStringLiteral("enrolment_port"), enrolmentPort},
                            {QStringLiteral("managed_port"), managedPort}};
    replace(json::overlaid(m_config, ports));
}

void Domain::add(QJsonObject terminal)
{
    terminal.insert(QStringLiteral("joined_at"), timeStamp());
    QJsonObject changed = m_config;
    append(changed, "known_terminals", terminal);
    replace(changed);
}

void Domain::remove(const QString &machineId)
{
    QJsonObject changed = m_config;
    const QJsonValue serial = terminal(machineId).value(QLatin1String("certificate_serial"));
    if (!serial.toString().isEmpty())
        append(changed, "revoked_certificates",
               {{QStringLiteral("certificate_serial"), serial},
                {QStringLiteral("machine_id"), machineId},
                {QStringLiteral("revoked_at"), timeStamp()}});
    QJsonArray remaining;
    const QJsonArray terminals = m_config.value(QLatin1String("known_terminals")).toArray();
    for (const QJsonValue each : terminals) {
        if (each[QLatin1String("machine_id")].toString() != machineId)
            remaining.append(each);
    }
    changed.insert(QStringLiteral("known_terminals"), remaining);
    replace(changed);
    m_permits.remove(machineId);
}

void Domain::allowRemoval(const QString &machineId, const QString &administrator)
{
    m_permits.insert(machineId, administrator);
}

bool Domain::mayRemove(const QString &machineId, const QString &administrator) const
{
    return m_permits.value(machineId) == administrator;
}

QJsonObject Domain::find(const char *list, const char *key, const QString &value) const
{
    const QJsonArray elements = m_config.value(QLatin1String(list)).toArray();
    for (const QJsonValue each : elements) {
        if (each[QLatin1String(key)].toString() == value)
            return each.toObject();
    }
    return {};
}

void Domain::replace(const QJsonObject &config)
{
    smallfile::saveObject(m_path, config, FileAccess::OwnerOnly);
    m_config = config;
}

} // namespace sandbox
