// SPDX-License-Identifier: Apache-2.0
#include "serverfixture.h"

#include <QFileInfo>
#include <QProcess>
#include <QtTest>

using namespace sandbox;

// What a server leaves in its folder, and how it starts on what it finds there.
class ManagementStateTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void aRestartKeepsEverything();
    void secretsAreTheOwnersOnly();
    void damagedFilesStayAsTheyAre_data();
    void damagedFilesStayAsTheyAre();
    void scenarioShapesANewServerOnly();
    void wrongKeyOfAScenario();
    void aNewNameMeansANewCertificate();
    void aPortInUseIsTold();
    void childrenInheritNoSocket();

private:
    std::unique_ptr<ServerFixture> m_server;
};

namespace {

const QString kMachine = QStringLiteral("5f0c1d3e-9a47-4c1b-8d26-70e4b1a9c352");
const QString kConfig = QStringLiteral("config.json");

} // namespace

void ManagementStateTest::init()
{
    m_server = std::make_unique<ServerFixture>(R"({"config": {"terminal_limit": 1}})");
    QCOMPARE(m_server->start(), QString());
}

void ManagementStateTest::aRestartKeepsEverything()
{
    const KeyPair pair = ServerFixture::pairOf(m_server->join(kMachine, QStringLiteral("one")));
    const quint16 enrolmentPort = m_server->enrolmentPort();
    const quint16 managedPort = m_server->managedPort();
    const QByteArray config = m_server->read(kConfig);
    const QByteArray certificate = m_server->read(QStringLiteral("managed.crt"));

    m_server->stop();
    QCOMPARE(m_server->start(), QString());

    QCOMPARE(m_server->enrolmentPort(), enrolmentPort);
    QCOMPARE(m_server->managedPort(), managedPort);
    QCOMPARE(m_server->read(kConfig), config);
    QCOMPARE(m_server->read(QStringLiteral("managed.crt")), certificate);
    QCOMPARE(m_server->join(kMachine, QStringLiteral("one")).status, 400);
    QVERIFY(m_server->leave(kMachine, pair).data().value(QStringLiteral("result")).toBool());

    m_server->stop();
    QCOMPARE(m_server->start(), QString());
    QCOMPARE(m_server->leave(kMachine, pair).msg(), QStringLiteral("终端证书已被吊销"));
}

void ManagementStateTest::secretsAreTheOwnersOnly()
{
    const auto others = QFile::ReadGroup | QFile::WriteGroup | QFile::ReadOther | QFile::WriteOther;
    for (const char *name : {"config.json", "ca.key", "enrolment.key", "managed.key"}) {
        const QFileInfo file(m_server->folder() + QLatin1Char('/') + QLatin1String(name));
        QVERIFY2(file.exists() && (file.permissions() & others) == 0, name);
    }
    QVERIFY((QFile::permissions(m_server->folder()) & others) == 0);
}

void ManagementStateTest::damagedFilesStayAsTheyAre_data()
{
    QTest::addColumn<QString>("file");
    QTest::addColumn<QByteArray>("contents");
    QTest::addColumn<QString>("trouble");
    const auto row = [](const char *name, const char *file, const char *contents, const char *trouble) {
        QTest::newRow(name) << QString::fromLatin1(file) << QByteArray(contents)
                            << QString::fromLatin1(trouble);
    };
    row("empty configuration", "config.json", "", "config.json: line 1 is no JSON");
    row("cut off configuration", "config.json", "{\"host\":", "config.json: line 1 is no JSON");
    row("unknown key", "config.json", "{\"alias_rules\": \"\"}",
        "config.json: \"alias_rules\" is unknown here");
    row("port out of range", "config.json", "{\"managed_port\": 65536}",
        "\"managed_port\" is not a whole number");
    row("account without a password", "config.json", "{\"accounts\": [{\"name\": \"a\"}]}",
        "\"accounts[0].password\" is missing or empty");
    row("terminals as an object", "config.json", "{\"known_terminals\": {}}",
        "\"known_terminals\" is not a list of objects");
    row("CA certificate", "ca.crt", "no certificate", "ca.crt");
    row("CA key", "ca.key", "", "ca.key");
    row("server certificate", "managed.crt", "no certificate", "managed.crt");
    row("server key", "enrolment.key", "no key", "enrolment.key");
}

void ManagementStateTest::damagedFilesStayAsTheyAre()
{
    QFETCH(QString, file);
    QFETCH(QByteArray, contents);
    QFETCH(QString, trouble);
    m_server->stop();
    QVERIFY(m_server->write(file, contents));

    const QString error = m_server->start();

    QVERIFY2(error.contains(m_server->folder()) && error.contains(trouble), qPrintable(error));
    QCOMPARE(m_server->read(file), contents);
}

void ManagementStateTest::scenarioShapesANewServerOnly()
{
    m_server->stop();
    QVERIFY(m_server->write(kConfig, "{}"));
    QCOMPARE(m_server->start(), QString());
    QVERIFY(m_server->read(kConfig).contains("\"terminal_limit\": 100"));
}

void ManagementStateTest::wrongKeyOfAScenario()
{
    ServerFixture server(R"({"config": {"terminal_limits": 1}})");
    QCOMPARE(
        server.start(),
        QStringLiteral("configuration of a new server: \"server.config.terminal_limits\" is unknown here"));
}

void ManagementStateTest::aNewNameMeansANewCertificate()
{
    const QByteArray before = m_server->read(QStringLiteral("enrolment.crt"));
    m_server->stop();
    QVERIFY(m_server->write(kConfig, R"({"host_names": ["uim.vesk.test", "second.vesk.test"]})"));
    QCOMPARE(m_server->start(), QString());
    QVERIFY(m_server->read(QStringLiteral("enrolment.crt")) != before);
    QCOMPARE(m_server->enrolment().send("GET", "/apiauth/v1/client/ca_cert").status, 200);
}

void ManagementStateTest::aPortInUseIsTold()
{
    ServerFixture second(
        "{\"config\": {\"enrolment_port\": " + QByteArray::number(m_server->enrolmentPort()) + "}}");
    QCOMPARE(second.start(),
             QStringLiteral("port %1: Address already in use").arg(m_server->enrolmentPort()));
    QVERIFY(second.read(kConfig).isEmpty());
}

void ManagementStateTest::childrenInheritNoSocket()
{
    QProcess child;
    child.start(QStringLiteral("sleep"), {QStringLiteral("60")});
    QVERIFY(child.waitForStarted());
    m_server->stop();
    QCOMPARE(m_server->start(), QString());
    child.kill();
    QVERIFY(child.waitForFinished());
}

QTEST_GUILESS_MAIN(ManagementStateTest)
#include "tst_management_state.moc"
