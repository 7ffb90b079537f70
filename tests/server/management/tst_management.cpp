// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"
#include "serverfixture.h"

#include <QDirIterator>
#include <QtTest>

#include <curl/curl.h>

using namespace sandbox;

namespace {

const QByteArray kStatus = "/uim/v3/client/status?keyword=remove&machine_id=";

} // namespace

// What no walk through the program covers: secrets of the server, who gets in, limits. That the endpoints do
// their work, and that faults are played, is proven by the rows of the campaign.
class ManagementTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init() { begin("{}"); }
    void secretsAreTheOwnersOnly();
    void theLimitCounts();
    void onlyCurrentCertificatesOpen();
    void strangersFailInTheHandshake();
    void removalNeedsItsAdministrator();
    void refusedRequests_data();
    void refusedRequests();
    void tooLargeABody();
    void damagedFilesStayAsTheyAre_data();
    void damagedFilesStayAsTheyAre();
    void aNewNameMeansANewCertificate();

private:
    void begin(const QByteArray &server)
    {
        m_server = std::make_unique<ServerFixture>(server);
        QCOMPARE(m_server->start(), QString());
    }

    std::unique_ptr<ServerFixture> m_server;
};

// The key of a terminal is in its answer and nowhere else.
void ManagementTest::secretsAreTheOwnersOnly()
{
    const KeyPair pair = m_server->join("m", "one").pair();
    QVERIFY(keyFits(pair.certificatePem, pair.keyPem));
    QCOMPARE(m_server->read("server/issued/m.crt"), pair.certificatePem);
    const auto others = QFile::ReadGroup | QFile::WriteGroup | QFile::ReadOther | QFile::WriteOther;
    QVERIFY((QFile::permissions(m_server->path("server")) & others) == 0);
    int secrets = 0;
    QDirIterator files(m_server->path(""), QDir::Files | QDir::Hidden, QDirIterator::Subdirectories);
    while (files.hasNext()) {
        const QString path = files.next();
        const QByteArray content = smallfile::read(path).value_or("");
        QVERIFY2(!content.contains(pair.keyPem.split('\n').at(1)), qPrintable(path));
        if (!content.contains("PRIVATE KEY-----") && !content.contains("Control-9"))
            continue;
        QVERIFY2((QFile::permissions(path) & others) == 0, qPrintable(path));
        ++secrets;
    }
    QCOMPARE(secrets, 4); // keys of CA, enrolment and managed address, and the configuration
}

void ManagementTest::theLimitCounts()
{
    begin(R"({"config": {"terminal_limit": 1}})");
    QCOMPARE(m_server->join("first", "one").code(), 0);
    QCOMPARE(m_server->join("second", "two").code(), -500000);
    QCOMPARE(m_server->join("first", "one").status, 400); // a known one is told so first
}

void ManagementTest::onlyCurrentCertificatesOpen()
{
    begin(R"({"config": {"known_terminals": [{"machine_id": "typed"}]}})");
    const auto ca =
        CertificateAuthority::load(m_server->path("server/ca.crt"), m_server->path("server/ca.key"));
    const auto codeOf = [&](const KeyPair &pair, const QByteArray &machine) {
        return m_server->sendAs(pair, "GET", kStatus + machine).code();
    };
    QCOMPARE(codeOf(ca.issueClient(QStringLiteral("typed")), "typed"), 40303);
    const KeyPair old = m_server->join("m", "one").pair();
    QCOMPARE(codeOf(old, "m"), 0);
    QVERIFY(m_server->leave("m", old).data().value(QStringLiteral("result")).toBool());
    QCOMPARE(codeOf(old, "m"), 40302);
    // The terminal joins again: its new certificate counts, the old one stays what it is.
    const KeyPair current = m_server->join("m", "one").pair();
    m_server->stop();
    QCOMPARE(m_server->start(), QString());
    QCOMPARE(codeOf(old, "m"), 40302);
    QCOMPARE(codeOf(current, "m"), 0);
}

void ManagementTest::strangersFailInTheHandshake()
{
    const auto other = CertificateAuthority::create(QStringLiteral("Enrolment sandbox CA"));
    const auto pair = other.issueClient(QStringLiteral("m"));
    const Answer answer = m_server->sendAs(pair, "GET", kStatus + "m");
    QVERIFY(answer.curlCode != CURLE_OK);
    QCOMPARE(answer.status, 0);
    QTRY_VERIFY(
        m_server->read("journal.log").contains(" TLS with 127.0.0.1 at the managed address failed: "));
}

void ManagementTest::removalNeedsItsAdministrator()
{
    const KeyPair pair = m_server->join("m", "one").pair();
    const auto remove = [&](const QByteArray &machine, const QByteArray &user) {
        return m_server
            ->sendAs(pair, "POST", "/uim/v3/client/remove",
                     R"({"machine_id":")" + machine + R"(","username":")" + user + R"(","mac":""})")
            .code();
    };
    QCOMPARE(remove("m", "liming"), 10004);
    QCOMPARE(remove("m", "admin"), 10005);
    QCOMPARE(remove("other", "admin"), 40304);
}

void ManagementTest::refusedRequests_data()
{
    QTest::addColumn<QByteArray>("request"); // method, target below the usual path, body
    QTest::addColumn<int>("status");
    QTest::addColumn<int>("code");
    const auto row = [](const char *name, const char *request, int status, int code) {
        QTest::newRow(name) << QByteArray(request) << status << code;
    };
    row("identity that is a path", "GET status?machine_id=..%2Fx&keyword=join", 400, 40003);
    row("join with a path for an identity",
        R"(POST join {"machine_id":"../ca","name":"n","username":"liming","mac":""})", 400, 40003);
    row("unknown account", R"(POST auth {"username":"nobody","password":"Terminal-7"})", 200, 10001);
    row("administrator's account", R"(POST auth {"username":"admin","password":"Control-9"})", 200, 10001);
    row("password as a number", R"(POST auth {"username":"liming","password":7})", 400, 40002);
    row("broken JSON", "POST auth {\"username\":", 400, 40001);
    row("removal without a certificate", "POST remove {}", 403, 40301);
    row("unknown path", "GET statuses", 404, 40400);
    row("wrong method", "GET join", 405, 40500);
}

void ManagementTest::refusedRequests()
{
    QFETCH(QByteArray, request);
    const QList<QByteArray> words = request.split(' ');
    const Answer answer =
        m_server->send(words.at(0).constData(), "/uim/v3/client/" + words.at(1), words.value(2));
    QTEST(answer.status, "status");
    QTEST(answer.code(), "code");
}

void ManagementTest::tooLargeABody()
{
    const QByteArray padding(16 * 1024 * 1024, 'x');
    QCOMPARE(m_server->send("POST", "/uim/v3/client/auth", padding).status, 413);
    QCOMPARE(m_server->send("POST", "/uim/v3/client/auth", padding.left(1000 * 1024)).status, 400);
}

void ManagementTest::damagedFilesStayAsTheyAre_data()
{
    QTest::addColumn<QByteArray>("contents");
    QTest::addColumn<QString>("told");
    const auto row = [](const char *name, const char *contents, const char *told) {
        QTest::newRow(name) << QByteArray(contents) << QString::fromLatin1(told);
    };
    row("server/config.json", "{\"host\":", "line 1 is not JSON");
    row("server/config.json ", R"({"alias_rules": ""})", "alias_rules");
    row("server/config.json  ", R"({"accounts": [{"name": "a"}]})", "password");
    row("server/ca.crt", "no certificate", "ca.crt");
    row("server/ca.key", "", "ca.key");
    row("server/managed.crt", "no certificate", "managed.crt");
    row("server/enrolment.key", "no key", "enrolment.key");
}

void ManagementTest::damagedFilesStayAsTheyAre()
{
    QFETCH(QByteArray, contents);
    QFETCH(QString, told);
    const QByteArray file = QByteArray(QTest::currentDataTag()).trimmed();
    m_server->stop();
    QVERIFY(m_server->write(file.constData(), contents));
    const QString error = m_server->start();
    QVERIFY2(error.startsWith(m_server->path("server")) && error.contains(told), qPrintable(error));
    QCOMPARE(m_server->read(file.constData()), contents);
}

void ManagementTest::aNewNameMeansANewCertificate()
{
    m_server->stop();
    const QByteArray before = m_server->read("server/enrolment.crt");
    QCOMPARE(m_server->start(), QString());
    QCOMPARE(m_server->read("server/enrolment.crt"), before);
    m_server->stop();
    QVERIFY(m_server->write("server/config.json", R"({"host_names": ["second.vesk.test"]})"));
    QCOMPARE(m_server->start(), QString());
    QVERIFY(m_server->read("server/enrolment.crt") != before);
}

QTEST_GUILESS_MAIN(ManagementTest)
#include "tst_management.moc"
