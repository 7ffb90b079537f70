// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "server/managementserver.h"
#include "webclient.h"

#include <QStringList>
#include <QTemporaryDir>

#include <memory>

// A management server in a folder of its own, clients of its two addresses, and what its journal says.
class ServerFixture
{
public:
    // `server` is the section of that name in a scenario, as JSON text.
    explicit ServerFixture(const QByteArray &server = "{}");

    // Empty when it worked.
    QString start();
    void stop() { m_server.reset(); }

    QString folder() const { return m_folder.filePath(QStringLiteral("server")); }
    QByteArray read(const QString &file) const;
    bool write(const QString &file, const QByteArray &contents) const;

    WebClient enrolment() const;
    WebClient managed(const sandbox::KeyPair &credentials) const;
    quint16 enrolmentPort() const { return m_server->enrolmentPort(); }
    quint16 managedPort() const { return m_server->managedPort(); }

    WebClient::Answer join(const QString &machineId, const QString &name) const;
    // The pair that a join's answer holds.
    static sandbox::KeyPair pairOf(const WebClient::Answer &joined);
    // An administrator lets the terminal with this pair go.
    WebClient::Answer leave(const QString &machineId, const sandbox::KeyPair &pair) const;

    // Source and text of each line, without the time.
    QStringList journal() const;

private:
    QTemporaryDir m_folder;
    sandbox::Scenario m_scenario;
    QString m_trouble;
    std::unique_ptr<sandbox::ManagementServer> m_server;
};
