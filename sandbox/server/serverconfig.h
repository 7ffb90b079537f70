// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QString>
#include <QStringList>
#include <QVector>

#include <optional>

namespace sandbox {

struct Account
{
    QString name;
    QString password;
    QString displayName;
    bool locked = false;
};

struct Department
{
    QString id;
    QString name;
};

// A terminal that has joined. Without `certificateSerial` (written by hand) it counts, but no certificate
// opens the managed address for it.
struct Terminal
{
    QString machineId;
    QString name; // its alias
    QString userName;
    QString mac;
    QString joinedAt; // ISO 8601, UTC
    QString certificateSerial;
};

struct RevokedCertificate
{
    QString serial;
    QString machineId;
    QString revokedAt; // ISO 8601, UTC
};

// What a management server knows and is told: the readable file STATE/server/config.json. A plain value;
// Domain changes it while the server runs. Passwords stand in it in clear, since a sandbox is there to be
// looked into; the file is its owner's only, and says so itself.
struct ServerConfig
{
    QString host = QStringLiteral("localhost");                // where terminals find the managed address
    QStringList hostNames = {QStringLiteral("uim.vesk.test")}; // further names in the server certificates
    int enrolmentPort = 0;                                     // 0: chosen at the first start, then kept
    int managedPort = 0;
    QString joinedDomain =
        QStringLiteral("{host}:{port}"); // what a join names, with host and managed port put in
    int terminalLimit = 100;
    QString aliasRule = QStringLiteral("[A-Za-z0-9-]+"); // empty: the server judges aliases itself
    QVector<Account> accounts = {
        {QStringLiteral("liming"), QStringLiteral("Terminal-7"), QStringLiteral("李明"), false}};
    QVector<Account> administrators = {
        {QStringLiteral("admin"), QStringLiteral("Control-9"), QStringLiteral("管理员"), false}};
    QVector<Department> departments = {{QStringLiteral("1"), QStringLiteral("总部")}};
    QVector<Terminal> knownTerminals;
    QVector<RevokedCertificate> revokedCertificates;

    // A new configuration with the keys of `overlay` (form of the file) in place of the defaults.
    static std::optional<ServerConfig> fresh(const QJsonObject &overlay, QString *error);

    // Reads a file; a missing key takes its default. A damaged file, an unknown key or a value of another
    // type is an error of one line that names file and key.
    static std::optional<ServerConfig> load(const QString &path, QString *error);

    // Replaces the file whole or not at all; mode 0600 from the first moment on.
    bool save(const QString &path, QString *error) const;
};

} // namespace sandbox
