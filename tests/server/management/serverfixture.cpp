// SPDX-License-Identifier: Apache-2.0
#include "serverfixture.h"

#include <QDir>
#include <QFile>
#include <QJsonDocument>

using namespace sandbox;

ServerFixture::ServerFixture(const QByteArray &server)
{
    write(QStringLiteral("../scenario.json"), R"({"title": "Server under test", "server": )" + server + '}');
    const auto scenario = Scenario::load(m_folder.filePath(QStringLiteral("scenario.json")), &m_trouble);
    if (scenario)
        m_scenario = *scenario;
}

QString ServerFixture::start()
{
    if (!m_trouble.isEmpty())
        return m_trouble;
    QString error;
    m_server = std::make_unique<ManagementServer>(folder(), m_scenario,
                                                  Journal(m_folder.filePath(QStringLiteral("journal.log"))));
    return m_server->start(&error) ? QString() : error;
}

QByteArray ServerFixture::read(const QString &file) const
{
    QFile source(QDir::cleanPath(folder() + QLatin1Char('/') + file));
    return source.open(QIODevice::ReadOnly) ? source.readAll() : QByteArray();
}

bool ServerFixture::write(const QString &file, const QByteArray &contents) const
{
    QFile target(QDir::cleanPath(folder() + QLatin1Char('/') + file));
    return target.open(QIODevice::WriteOnly) && target.write(contents) == contents.size();
}

WebClient ServerFixture::enrolment() const
{
    WebClient client;
    client.caPem = read(QStringLiteral("ca.crt"));
    client.port = m_server->enrolmentPort();
    return client;
}

WebClient ServerFixture::managed(const KeyPair &credentials) const
{
    WebClient client = enrolment();
    client.port = m_server->managedPort();
    client.credentials = credentials;
    return client;
}

WebClient::Answer ServerFixture::join(const QString &machineId, const QString &name) const
{
    const QJsonObject body = {{QStringLiteral("machine_id"), machineId},
                              {QStringLiteral("name"), name},
                              {QStringLiteral("username"), QStringLiteral("liming")},
                              {QStringLiteral("mac"), QStringLiteral("02:00:5e:10:00:01")}};
    return enrolment().send("POST", "/uim/v3/client/join", QJsonDocument(body).toJson());
}

KeyPair ServerFixture::pairOf(const WebClient::Answer &joined)
{
    const auto decoded = [&](const char *key) {
        return QByteArray::fromBase64(joined.data().value(QLatin1String(key)).toString().toLatin1());
    };
    return {decoded("cert"), decoded("key")};
}

WebClient::Answer ServerFixture::leave(const QString &machineId, const KeyPair &pair) const
{
    const WebClient client = managed(pair);
    QJsonObject body = {{QStringLiteral("machine_id"), machineId},
                        {QStringLiteral("username"), QStringLiteral("admin")},
                        {QStringLiteral("password"), QStringLiteral("Control-9")}};
    client.send("POST", "/uim/v3/client/remove_status", QJsonDocument(body).toJson());
    body.remove(QStringLiteral("password"));
    body.insert(QStringLiteral("mac"), QString());
    return client.send("POST", "/uim/v3/client/remove", QJsonDocument(body).toJson());
}

QStringList ServerFixture::journal() const
{
    constexpr int kStampLength = 24;
    QStringList lines = QString::fromUtf8(read(QStringLiteral("../journal.log"))).split(QLatin1Char('\n'));
    lines.removeLast();
    for (QString &line : lines)
        line.remove(0, kStampLength);
    return lines;
}
