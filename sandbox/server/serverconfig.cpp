// SPDX-License-Identifier: Apache-2.0
#include "server/serverconfig.h"

#include "scenario/strictobject.h"

#include <QFile>
#include <QJsonDocument>
#include <QSaveFile>

namespace sandbox {

namespace {

constexpr int kHighestPort = 65535;
constexpr int kMostTerminals = 1000000;

const char *const kComment =
    "Read when the server starts: edit it while the server is down. Passwords stand here "
    "in clear, so this file is its owner's only and no real password belongs in it.";

template <typename T>
void take(std::optional<T> value, T &target)
{
    if (value)
        target = std::move(*value);
}

QString required(StrictObject &object, const char *key)
{
    QString text = object.text(key).value_or(QString());
    if (text.isEmpty())
        object.refuse(QLatin1String(key), QStringLiteral("is missing or empty"));
    return text;
}

template <typename T, typename Read>
void takeList(StrictObject &object, const char *key, QVector<T> &target, Read read)
{
    QVector<T> list;
    if (object.forEach(key, [&](StrictObject &element) { list += read(element); }))
        target = list;
}

Account readAccount(StrictObject &object)
{
    Account account;
    account.name = required(object, "name");
    account.password = required(object, "password");
    take(object.text("display_name"), account.displayName);
    take(object.flag("locked"), account.locked);
    return account;
}

Department readDepartment(StrictObject &object)
{
    return {required(object, "id"), required(object, "name")};
}

Terminal readTerminal(StrictObject &object)
{
    Terminal terminal;
    terminal.machineId = required(object, "machine_id");
    take(object.text("name"), terminal.name);
    take(object.text("username"), terminal.userName);
    take(object.text("mac"), terminal.mac);
    take(object.text("joined_at"), terminal.joinedAt);
    take(object.text("certificate_serial"), terminal.certificateSerial);
    return terminal;
}

RevokedCertificate readRevoked(StrictObject &object)
{
    RevokedCertificate revoked;
    revoked.serial = required(object, "certificate_serial");
    take(object.text("machine_id"), revoked.machineId);
    take(object.text("revoked_at"), revoked.revokedAt);
    return revoked;
}

ServerConfig read(StrictObject object)
{
    ServerConfig config;
    object.text("comment");
    take(object.text("host"), config.host);
    take(object.texts("host_names"), config.hostNames);
    take(object.number("enrolment_port", 0, kHighestPort), config.enrolmentPort);
    take(object.number("managed_port", 0, kHighestPort), config.managedPort);
    take(object.text("joined_domain"), config.joinedDomain);
    take(object.number("terminal_limit", 0, kMostTerminals), config.terminalLimit);
    take(object.text("alias_rule"), config.aliasRule);
    takeList(object, "accounts", config.accounts, readAccount);
    takeList(object, "administrators", config.administrators, readAccount);
    takeList(object, "departments", config.departments, readDepartment);
    takeList(object, "known_terminals", config.knownTerminals, readTerminal);
    takeList(object, "revoked_certificates", config.revokedCertificates, readRevoked);
    object.refuseOthers();
    return config;
}

QJsonObject toJson(const Account &account)
{
    return {{QStringLiteral("name"), account.name},
            {QStringLiteral("password"), account.password},
            {QStringLiteral("display_name"), account.displayName},
            {QStringLiteral("locked"), account.locked}};
}

QJsonObject toJson(const Department &department)
{
    return {{QStringLiteral("id"), department.id}, {QStringLiteral("name"), department.name}};
}

QJsonObject toJson(const Terminal &terminal)
{
    return {{QStringLiteral("machine_id"), terminal.machineId},
            {QStringLiteral("name"), terminal.name},
            {QStringLiteral("username"), terminal.userName},
            {QStringLiteral("mac"), terminal.mac},
            {QStringLiteral("joined_at"), terminal.joinedAt},
            {QStringLiteral("certificate_serial"), terminal.certificateSerial}};
}

QJsonObject toJson(const RevokedCertificate &revoked)
{
    return {{QStringLiteral("certificate_serial"), revoked.serial},
            {QStringLiteral("machine_id"), revoked.machineId},
            {QStringLiteral("revoked_at"), revoked.revokedAt}};
}

template <typename T>
QJsonArray toArray(const QVector<T> &list)
{
    QJsonArray array;
    for (const T &element : list)
        array += toJson(element);
    return array;
}

QJsonObject toJson(const ServerConfig &config)
{
    return {{QStringLiteral("comment"), QLatin1String(kComment)},
            {QStringLiteral("host"), config.host},
            {QStringLiteral("host_names"), QJsonArray::fromStringList(config.hostNames)},
            {QStringLiteral("enrolment_port"), config.enrolmentPort},
            {QStringLiteral("managed_port"), config.managedPort},
            {QStringLiteral("joined_domain"), config.joinedDomain},
            {QStringLiteral("terminal_limit"), config.terminalLimit},
            {QStringLiteral("alias_rule"), config.aliasRule},
            {QStringLiteral("accounts"), toArray(config.accounts)},
            {QStringLiteral("administrators"), toArray(config.administrators)},
            {QStringLiteral("departments"), toArray(config.departments)},
            {QStringLiteral("known_terminals"), toArray(config.knownTerminals)},
            {QStringLiteral("revoked_certificates"), toArray(config.revokedCertificates)}};
}

} // namespace

std::optional<ServerConfig> ServerConfig::fresh(const QJsonObject &overlay, QString *error)
{
    try {
        return read({overlay, QStringLiteral("server.config")});
    } catch (const JsonTrouble &trouble) {
        *error = QStringLiteral("configuration of a new server: %1").arg(trouble.text);
        return std::nullopt;
    }
}

std::optional<ServerConfig> ServerConfig::load(const QString &path, QString *error)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        *error = QStringLiteral("%1: cannot be read: %2").arg(path, file.errorString());
        return std::nullopt;
    }
    try {
        return read(StrictObject::parse(file.readAll()));
    } catch (const JsonTrouble &trouble) {
        *error = QStringLiteral("%1: %2").arg(path, trouble.text);
        return std::nullopt;
    }
}

bool ServerConfig::save(const QString &path, QString *error) const
{
    QSaveFile file(path);
    const bool written = file.open(QIODevice::WriteOnly) &&
                         file.setPermissions(QFileDevice::ReadOwner | QFileDevice::WriteOwner) &&
                         file.write(QJsonDocument(toJson(*this)).toJson()) >= 0 && file.commit();
    if (!written)
        *error = QStringLiteral("%1: cannot be written: %2").arg(path, file.errorString());
    return written;
}

} // namespace sandbox
