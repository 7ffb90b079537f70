// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificate.h"
#include "server/managementserver.h"

#include <QJsonObject>
#include <QTemporaryDir>

#include <memory>

struct Answer
{
    int curlCode = -1; // CURLE_OK is 0
    int status = 0;
    QByteArray body;

    QJsonObject json() const;
    int code() const { return json().value(QStringLiteral("code")).toInt(-1); }
    QJsonObject data() const { return json().value(QStringLiteral("data")).toObject(); }
    // The pair that the answer to a join holds.
    sandbox::KeyPair pair() const;
};

// A management server in a directory of its own, and a client on libcurl to look at it with other eyes than
// the product's.
class ServerFixture
{
public:
    // `server` is the section of that name in a scenario, as JSON text.
    explicit ServerFixture(const QByteArray &server = "{}");

    // Empty when it worked.
    QString start();
    void stop() { m_server.reset(); }

    QString path(const char *file) const { return m_directory.filePath(QLatin1String(file)); }
    QByteArray read(const char *file) const;
    bool write(const char *file, const QByteArray &contents) const;

    // One request on a connection of its own, at the managed address when a pair is given. `target` is path
    // and query; the body is sent with every method when it is not empty.
    Answer send(const char *method, const QByteArray &target, const QByteArray &body = {}) const;
    Answer sendAs(const sandbox::KeyPair &pair, const char *method, const QByteArray &target,
                  const QByteArray &body = {}) const;
    Answer join(const QByteArray &machineId, const QByteArray &name) const;
    // An administrator lets the terminal with this pair go.
    Answer leave(const QByteArray &machineId, const sandbox::KeyPair &pair) const;

private:
    QTemporaryDir m_directory;
    sandbox::Scenario m_scenario;
    std::unique_ptr<sandbox::ManagementServer> m_server;
};
