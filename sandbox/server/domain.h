// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QHash>
#include <QJsonObject>

namespace sandbox {

// The domain that the server manages: who may log in, which terminals belong to it, which certificates are
// valid. It stands in the readable file STATE/server/config.json, whose keys scenario.schema.json tells
// (definition serverConfig); a missing one takes its default. Passwords stand there in clear, since a sandbox
// is there to be looked into; the file is its owner's only. Each change is in the file before the function
// returns. Used by the endpoints, from the server's thread only.
class Domain
{
public:
    // Reads the file, or makes a new domain with the keys of `ofNew` in place of the defaults. Throws an
    // Error for a damaged file or a key or value that the schema does not know; the file stays as it is.
    Domain(const QString &path, const QJsonObject &ofNew);

    QString text(const char *key) const { return m_config.value(QLatin1String(key)).toString(); }
    int number(const char *key) const { return m_config.value(QLatin1String(key)).toInt(); }
    QStringList texts(const char *key) const
    {
        return m_config.value(QLatin1String(key)).toVariant().toStringList();
    }

    // Empty when there is none (names are compared exactly).
    QJsonObject account(const QString &name) const { return find("accounts", "name", name); }
    QJsonObject administrator(const QString &name) const { return find("administrators", "name", name); }
    QJsonObject terminal(const QString &id) const { return find("known_terminals", "machine_id", id); }

    bool isFull() const;
    bool isNameTaken(const QString &name) const { return !find("known_terminals", "name", name).isEmpty(); }
    bool isRevoked(const QString &serial) const
    {
        return !find("revoked_certificates", "certificate_serial", serial).isEmpty();
    }

    // All three throw an Error and change nothing when the file cannot be written.
    void keepPorts(int enrolmentPort, int managedPort);
    // `terminal`: as it stands in the file; the time is added.
    void add(QJsonObject terminal);
    // Takes the terminal out and revokes its certificate.
    void remove(const QString &machineId);

    // An administrator allows one removal of one terminal, until the server ends.
    void allowRemoval(const QString &machineId, const QString &administrator);
    bool mayRemove(const QString &machineId, const QString &administrator) const;

private:
    QJsonObject find(const char *list, const char *key, const QString &value) const;
    void replace(const QJsonObject &config);

    QString m_path;
    QJsonObject m_config;
    QHash<QString, QString> m_permits; // administrators, by machine identity
};

} // namespace sandbox
