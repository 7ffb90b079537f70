// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"
#include "serverfixture.h"

#include <QDirIterator>
#include <QtTest>

using namespace sandbox;

// How terminals join and leave, and which certificates open the managed address.
class ManagementTerminalsTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void joinIssuesAWorkingPair();
    void joinNamesTheManagedAddress_data();
    void joinNamesTheManagedAddress();
    void oneTerminalJoinsOnce();
    void theLimitCounts();
    void leavingFreesPlaceAndName();
    void revokedCertificateOpensNothing();
    void strangersFailInTheHandshake_data();
    void strangersFailInTheHandshake();
    void otherTerminalsCertificate();
    void handWrittenTerminalHasNoCertificate();
    void whoMayRemove_data();
    void whoMayRemove();
    void removalNeedsItsAdministrator();
    void managedQuestions_data();
    void managedQuestions();

private:
    void begin(const QByteArray &server);

    std::unique_ptr<ServerFixture> m_server;
};

namespace {

const QString kMachine = QStringLiteral("5f0c1d3e-9a47-4c1b-8d26-70e4b1a9c352");
const QByteArray kStatus = "/uim/v3/client/status?keyword=remove&machine_id=";

} // namespace

void ManagementTerminalsTest::begin(const QByteArray &server)
{
    m_server = std::make_unique<ServerFixture>(server);
    QCOMPARE(m_server->start(), QString());
}

void ManagementTerminalsTest::init()
{
    begin("{}");
}

void ManagementTerminalsTest::joinIssuesAWorkingPair()
{
    const auto joined = m_server->join(kMachine, QStringLiteral("one"));
    QCOMPARE(joined.code(), 0);
    const KeyPair pair = ServerFixture::pairOf(joined);
    QVERIFY(keyFits(pair.certificatePem, pair.keyPem));
    QCOMPARE(certificateCommonName(pair.certificatePem), kMachine);

    const auto answer = m_server->managed(pair).send("GET", kStatus + kMachine.toUtf8());
    QCOMPARE(answer.trouble, QByteArray());
    QVERIFY(answer.data().value(QStringLiteral("result")).toBool());

    // The certificate is kept, the key is nowhere.
    QCOMPARE(m_server->read(QStringLiteral("issued/%1.crt").arg(kMachine)), pair.certificatePem);
    const QByteArray secret = pair.keyPem.split('\n').at(1);
    QDirIterator files(m_server->folder() + QLatin1String("/.."), QDir::Files, QDirIterator::Subdirectories);
    while (files.hasNext()) {
        QFile file(files.next());
        QVERIFY(file.open(QIODevice::ReadOnly));
        QVERIFY2(!file.readAll().contains(secret), qPrintable(file.fileName()));
    }
}

void ManagementTerminalsTest::joinNamesTheManagedAddress_data()
{
    QTest::addColumn<QString>("form");
    QTest::addColumn<QString>("expected");
    QTest::newRow("host and port") << QStringLiteral("{host}:{port}") << QStringLiteral("uim.vesk.test:%1");
    QTest::newRow("host alone") << QStringLiteral("{host}") << QStringLiteral("uim.vesk.test");
    QTest::newRow("two colons") << QStringLiteral("{host}:{port}:1") << QStringLiteral("uim.vesk.test:%1:1");
}

void ManagementTerminalsTest::joinNamesTheManagedAddress()
{
    QFETCH(QString, form);
    QFETCH(QString, expected);
    begin(R"({"config": {"host": "uim.vesk.test", "joined_domain": ")" + form.toUtf8() + "\"}}");
    if (expected.contains(QLatin1Char('%')))
        expected = expected.arg(m_server->managedPort());
    const auto joined = m_server->join(kMachine, QStringLiteral("one"));
    QCOMPARE(joined.data().value(QStringLiteral("joined_domain")).toString(), expected);
}

void ManagementTerminalsTest::oneTerminalJoinsOnce()
{
    const KeyPair pair = ServerFixture::pairOf(m_server->join(kMachine, QStringLiteral("one")));

    const auto again = m_server->join(kMachine, QStringLiteral("two"));

    QCOMPARE(again.status, 400);
    QCOMPARE(again.msg(), QStringLiteral("服务器已有此终端"));
    QVERIFY(again.data().value(QStringLiteral("key")).isUndefined());
    QCOMPARE(m_server->managed(pair).send("GET", kStatus + kMachine.toUtf8()).status, 200);
}

void ManagementTerminalsTest::theLimitCounts()
{
    begin(R"({"config": {"terminal_limit": 1}})");
    QCOMPARE(m_server->join(QStringLiteral("first"), QStringLiteral("one")).code(), 0);

    QCOMPARE(m_server->join(QStringLiteral("second"), QStringLiteral("two")).code(), -500000);
    const auto second =
        m_server->enrolment().send("GET", "/uim/v3/client/status?machine_id=second&keyword=join");
    QCOMPARE(second.status, 200);
    QCOMPARE(second.code(), -500000);
    const auto first =
        m_server->enrolment().send("GET", "/uim/v3/client/status?machine_id=first&keyword=join");
    QCOMPARE(first.code(), 0);
    QCOMPARE(first.msg(), QStringLiteral("终端已加域"));
}

void ManagementTerminalsTest::leavingFreesPlaceAndName()
{
    begin(R"({"config": {"terminal_limit": 1}})");
    for (int round = 0; round < 2; ++round) {
        const auto joined = m_server->join(kMachine, QStringLiteral("one"));
        QCOMPARE(joined.code(), 0);
        const auto left = m_server->leave(kMachine, ServerFixture::pairOf(joined));
        QCOMPARE(left.msg(), QString());
        QVERIFY(left.data().value(QStringLiteral("result")).toBool());
    }
}

void ManagementTerminalsTest::revokedCertificateOpensNothing()
{
    const KeyPair old = ServerFixture::pairOf(m_server->join(kMachine, QStringLiteral("one")));
    m_server->leave(kMachine, old);
    for (int round = 0; round < 2; ++round) {
        const auto answer = m_server->managed(old).send("GET", kStatus + kMachine.toUtf8());
        QCOMPARE(answer.status, 403);
        QCOMPARE(answer.msg(), QStringLiteral("终端证书已被吊销"));
        // The terminal joins again: its new certificate counts, the old one stays what it is.
        m_server->join(kMachine, QStringLiteral("one"));
    }
}

void ManagementTerminalsTest::strangersFailInTheHandshake_data()
{
    QTest::addColumn<bool>("foreign");
    QTest::newRow("no certificate") << false;
    QTest::newRow("certificate of another CA") << true;
}

void ManagementTerminalsTest::strangersFailInTheHandshake()
{
    QFETCH(bool, foreign);
    QVERIFY(m_server->join(kMachine, QStringLiteral("one")).code() == 0);
    KeyPair pair;
    if (foreign) {
        const auto authority = CertificateAuthority::create(QStringLiteral("Enrolment sandbox CA"), nullptr);
        pair = authority->issueClient(kMachine, nullptr).value();
    }

    const auto answer = m_server->managed(pair).send("GET", kStatus + kMachine.toUtf8());

    QVERIFY(answer.curlCode != 0);
    QCOMPARE(answer.status, 0);
    QTRY_VERIFY(m_server->journal().last().startsWith(
        QLatin1String("server    TLS with 127.0.0.1 at the managed address failed: ")));
}

void ManagementTerminalsTest::otherTerminalsCertificate()
{
    m_server->join(kMachine, QStringLiteral("one"));
    const KeyPair other =
        ServerFixture::pairOf(m_server->join(QStringLiteral("other"), QStringLiteral("two")));

    const auto answer = m_server->leave(kMachine, other);

    QCOMPARE(answer.status, 403);
    QCOMPARE(answer.msg(), QStringLiteral("终端证书与终端标识不一致"));
    QCOMPARE(m_server->join(kMachine, QStringLiteral("one")).status, 400); // still there
}

void ManagementTerminalsTest::handWrittenTerminalHasNoCertificate()
{
    begin(R"({"config": {"known_terminals": [{"machine_id": "typed"}]}})");
    QString error;
    const QString ca = m_server->folder() + QLatin1String("/ca");
    const auto authority =
        CertificateAuthority::load(ca + QLatin1String(".crt"), ca + QLatin1String(".key"), &error);
    QVERIFY2(authority, qPrintable(error));
    const auto pair = authority->issueClient(QStringLiteral("typed"), &error);

    const auto answer = m_server->managed(pair.value()).send("GET", kStatus + "typed");

    QCOMPARE(answer.status, 403);
    QCOMPARE(answer.msg(), QStringLiteral("终端证书不属于已加域的终端"));
}

void ManagementTerminalsTest::whoMayRemove_data()
{
    QTest::addColumn<QByteArray>("user");
    QTest::addColumn<QByteArray>("password");
    QTest::addColumn<QString>("msg");
    const auto row = [](const char *name, const char *user, const char *password, const char *msg) {
        QTest::newRow(name) << QByteArray(user) << QByteArray(password) << QString::fromUtf8(msg);
    };
    row("administrator", "admin", "Control-9", "");
    row("administrator, wrong password", "admin", "Terminal-7", "帐号或密码错误");
    row("ordinary account", "liming", "Terminal-7", "该帐号不是管理员，无权解除管控");
    row("ordinary account, wrong password", "liming", "Control-9", "帐号或密码错误");
    row("unknown account", "nobody", "Control-9", "帐号或密码错误");
}

void ManagementTerminalsTest::whoMayRemove()
{
    QFETCH(QByteArray, user);
    QFETCH(QByteArray, password);
    QFETCH(QString, msg);
    const KeyPair pair = ServerFixture::pairOf(m_server->join(kMachine, QStringLiteral("one")));

    const auto answer =
        m_server->managed(pair).send("POST", "/uim/v3/client/remove_status",
                                     R"({"machine_id":")" + kMachine.toUtf8() + R"(","username":")" + user +
                                         R"(","password":")" + password + "\"}");

    QCOMPARE(answer.status, 200);
    QCOMPARE(answer.msg(), msg);
    QCOMPARE(answer.code() == 0, msg.isEmpty());
    QCOMPARE(answer.data().value(QStringLiteral("result")).toBool(), msg.isEmpty());
}

void ManagementTerminalsTest::removalNeedsItsAdministrator()
{
    KeyPair pair = ServerFixture::pairOf(m_server->join(kMachine, QStringLiteral("one")));
    const auto remove = [&](const QByteArray &user) {
        const QByteArray body =
            R"({"machine_id":")" + kMachine.toUtf8() + R"(","username":")" + user + R"(","mac":""})";
        return m_server->managed(pair).send("POST", "/uim/v3/client/remove", body).msg();
    };
    const QString refused = QStringLiteral("请先由管理员授权解除管控");
    QCOMPARE(remove("liming"), QStringLiteral("该帐号不是管理员，无权解除管控"));
    QCOMPARE(remove("admin"), refused);

    m_server->leave(kMachine, pair);
    pair = ServerFixture::pairOf(m_server->join(kMachine, QStringLiteral("one")));
    QCOMPARE(remove("admin"), refused); // what was allowed once is not allowed again
}

void ManagementTerminalsTest::managedQuestions_data()
{
    QTest::addColumn<QByteArray>("target");
    QTest::addColumn<QByteArray>("body");
    QTest::addColumn<QByteArray>("expected");
    QTest::newRow("department") << QByteArray("uim_department/id?id=1") << QByteArray()
                                << QByteArray(R"({"code":0,"data":{"id":"1","name":"总部"},"msg":""})");
    QTest::newRow("unknown department")
        << QByteArray("uim_department/id?id=2") << QByteArray()
        << QByteArray(R"({"code":10009,"data":{"result":false},"msg":"部门不存在"})");
    QTest::newRow("account")
        << QByteArray("account")
        << QByteArray(R"({"username":"liming","machine_id":")" + kMachine.toUtf8() + "\"}")
        << QByteArray(
               R"({"code":0,"data":{"display_name":"李明","locked":false,"username":"liming"},"msg":""})");
    QTest::newRow("enrolment's own path")
        << QByteArray("join") << QByteArray("{}")
        << QByteArray(R"({"code":40400,"data":{"result":false},"msg":"接口不存在"})");
}

void ManagementTerminalsTest::managedQuestions()
{
    QFETCH(QByteArray, target);
    QFETCH(QByteArray, body);
    QFETCH(QByteArray, expected);
    const KeyPair pair = ServerFixture::pairOf(m_server->join(kMachine, QStringLiteral("one")));
    QCOMPARE(m_server->managed(pair).send("GET", "/uim/v3/client/" + target, body).body, expected);
}

QTEST_GUILESS_MAIN(ManagementTerminalsTest)
#include "tst_management_terminals.moc"
