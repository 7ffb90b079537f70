// SPDX-License-Identifier: Apache-2.0
#include "serverfixture.h"

#include <QElapsedTimer>
#include <QtTest>

#include <curl/curl.h>

// Replies that scenarios script or break, requests that go too far, and what the journal says of all this.
class ManagementFaultsTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void faults_data();
    void faults();
    void joinHappensBeforeItsReplyIsLost();
    void scriptedReplies_data();
    void scriptedReplies();
    void aScriptServesItsTimes();
    void delayHoldsOneReplyOnly();
    void delayedReplyComes();
    void nothingListens();
    void plainHttp();
    void tooLargeABody();
    void journalTellsRequestAndReply();
    void journalHidesSecrets_data();
    void journalHidesSecrets();

private:
    void begin(const QByteArray &server);
    WebClient::Answer ask(const QByteArray &body = "{}") const
    {
        return m_server->enrolment().send("POST", "/uim/v3/client/auth", body);
    }

    std::unique_ptr<ServerFixture> m_server;
};

void ManagementFaultsTest::begin(const QByteArray &server)
{
    m_server = std::make_unique<ServerFixture>(server);
    QCOMPARE(m_server->start(), QString());
}

void ManagementFaultsTest::faults_data()
{
    QTest::addColumn<QByteArray>("fault");
    QTest::addColumn<int>("curlCode");
    QTest::addColumn<QByteArray>("received"); // of the body
    QTest::newRow("close") << QByteArray("close-before-reply") << int(CURLE_GOT_NOTHING) << QByteArray();
    QTest::newRow("reset") << QByteArray("reset") << int(CURLE_RECV_ERROR) << QByteArray();
    QTest::newRow("half a header") << QByteArray("half-header") << int(CURLE_OK) << QByteArray();
    QTest::newRow("half a body") << QByteArray("truncate") << int(CURLE_PARTIAL_FILE) << QByteArray("01234");
    QTest::newRow("drip") << QByteArray("drip") << int(CURLE_ABORTED_BY_CALLBACK) << QByteArray();
    QTest::newRow("garbage") << QByteArray("garbage") << int(CURLE_UNSUPPORTED_PROTOCOL) << QByteArray();
}

void ManagementFaultsTest::faults()
{
    QFETCH(QByteArray, fault);
    QFETCH(QByteArray, received);
    begin(R"({"endpoints": {"auth": {"body": "0123456789", "times": 1, "fault": ")" + fault + "\"}}}");
    WebClient client = m_server->enrolment();
    client.givesUp = [&] {
        return fault == "drip" && m_server->journal().size() == 2;
    };

    const auto answer = client.send("POST", "/uim/v3/client/auth", "{}");

    QTEST(answer.curlCode, "curlCode");
    QCOMPARE(answer.body, received);
    QCOMPARE(m_server->journal(),
             QStringList({QStringLiteral("server    request POST /uim/v3/client/auth from 127.0.0.1 {}"),
                          QStringLiteral("server    fault %1 to POST /uim/v3/client/auth")
                              .arg(QString::fromLatin1(fault))}));
    QCOMPARE(ask().status, 400); // the server is well again
}

void ManagementFaultsTest::joinHappensBeforeItsReplyIsLost()
{
    begin(R"({"endpoints": {"join": {"fault": "reset", "times": 1}}})");
    QCOMPARE(m_server->join(QStringLiteral("m"), QStringLiteral("one")).status, 0);
    QCOMPARE(m_server->join(QStringLiteral("m"), QStringLiteral("one")).msg(),
             QStringLiteral("服务器已有此终端"));
}

void ManagementFaultsTest::scriptedReplies_data()
{
    QTest::addColumn<QByteArray>("script");
    QTest::addColumn<int>("status");
    QTest::addColumn<QByteArray>("body");
    QTest::addColumn<QByteArray>("type");
    const QByteArray html = "text/html";
    const QByteArray json = "application/json";
    QTest::newRow("status alone") << QByteArray(R"({"status": 500})") << 500 << QByteArray() << html;
    QTest::newRow("text") << QByteArray(R"({"status": 503, "body": "<h1>域</h1>"})") << 503
                          << QByteArray("<h1>域</h1>") << html;
    QTest::newRow("JSON") << QByteArray(R"({"json": {"code": 5, "msg": "不"}})") << 200
                          << QByteArray(R"({"code":5,"msg":"不"})") << json;
}

void ManagementFaultsTest::scriptedReplies()
{
    QFETCH(QByteArray, script);
    QFETCH(QByteArray, type);
    begin(R"({"endpoints": {"auth": )" + script + "}}");
    const auto answer = ask();
    QCOMPARE(answer.curlCode, int(CURLE_OK));
    QTEST(answer.status, "status");
    QTEST(answer.body, "body");
    QVERIFY(answer.header.contains("Content-Type: " + type));
}

void ManagementFaultsTest::aScriptServesItsTimes()
{
    begin(R"({"endpoints": {"auth": {"status": 500, "times": 2}}})");
    QCOMPARE(ask().status, 500);
    QCOMPARE(m_server->enrolment().send("GET", "/apiauth/v1/client/ca_cert").status, 200);
    QCOMPARE(ask().status, 500);
    QCOMPARE(ask().status, 400);
}

void ManagementFaultsTest::delayHoldsOneReplyOnly()
{
    begin(R"({"endpoints": {"auth": {"delay_ms": 600000}}})");
    WebClient held = m_server->enrolment();
    int other = 0;
    held.givesUp = [&] {
        if (other != 0 || m_server->journal().isEmpty())
            return false;
        other = m_server->enrolment().send("GET", "/apiauth/v1/client/ca_cert").status;
        m_server->stop(); // which ends what is under way
        return false;
    };
    const int code = held.send("POST", "/uim/v3/client/auth", "{}").curlCode;
    QCOMPARE(other, 200);
    QVERIFY2(code == CURLE_GOT_NOTHING || code == CURLE_RECV_ERROR, qPrintable(QString::number(code)));
}

void ManagementFaultsTest::delayedReplyComes()
{
    begin(R"({"endpoints": {"auth": {"status": 200, "delay_ms": 300}}})");
    QElapsedTimer timer;
    timer.start();
    QCOMPARE(ask().status, 200);
    QVERIFY(timer.elapsed() >= 300);
}

void ManagementFaultsTest::nothingListens()
{
    begin(R"({"listen": false})");
    QVERIFY(m_server->enrolmentPort() != 0);
    QCOMPARE(ask().curlCode, int(CURLE_COULDNT_CONNECT));
}

void ManagementFaultsTest::plainHttp()
{
    begin(R"({"tls": false})");
    QCOMPARE(ask().curlCode, int(CURLE_SSL_CONNECT_ERROR));
    QCOMPARE(m_server->journal(), QStringList{QStringLiteral("server    answered a client in plain HTTP")});
}

void ManagementFaultsTest::tooLargeABody()
{
    begin("{}");
    const QByteArray padding(16 * 1024 * 1024, 'x');
    const auto answer = ask(R"({"username":")" + padding + "\"}");
    QCOMPARE(answer.status, 413);
    QCOMPARE(answer.msg(), QStringLiteral("请求内容过大"));
    QCOMPARE(m_server->journal().first(),
             QStringLiteral("server    request POST /uim/v3/client/auth from 127.0.0.1"));
    QCOMPARE(ask(padding.left(1000 * 1024)).status, 400); // below the limit, and no JSON
}

void ManagementFaultsTest::journalTellsRequestAndReply()
{
    begin("{}");
    const auto joined = m_server->join(QStringLiteral("m-1"), QStringLiteral("one"));
    m_server->managed(ServerFixture::pairOf(joined))
        .send("GET", "/uim/v3/client/status?machine_id=m-1&keyword=remove");

    const QStringList journal = m_server->journal();
    QCOMPARE(journal.size(), 4);
    QCOMPARE(journal.at(0),
             QStringLiteral(
                 R"(server    request POST /uim/v3/client/join from 127.0.0.1 {"mac":"02:00:5e:10:00:01",)"
                 R"("machine_id":"m-1","name":"one","username":"liming"})"));
    const QString reply = QStringLiteral(R"(server    reply 200 {"code":0,"data":{"cert":"<%1 bytes>",)"
                                         R"("joined_domain":"localhost:%3","key":"<%2 bytes>"},"msg":""})"
                                         R"( to POST /uim/v3/client/join)");
    QCOMPARE(journal.at(1), reply.arg(joined.data().value(QStringLiteral("cert")).toString().size())
                                .arg(joined.data().value(QStringLiteral("key")).toString().size())
                                .arg(m_server->managedPort()));
    QCOMPARE(journal.at(2),
             QStringLiteral("server    request GET /uim/v3/client/status?machine_id=m-1&keyword=remove"
                            " from 127.0.0.1 client certificate m-1"));
    QCOMPARE(journal.at(3), QStringLiteral(R"(server    reply 200 {"code":0,"data":{"result":true},"msg":""})"
                                           R"( to GET /uim/v3/client/status)"));
}

void ManagementFaultsTest::journalHidesSecrets_data()
{
    QTest::addColumn<QByteArray>("target");
    QTest::addColumn<QByteArray>("body");
    QTest::newRow("field") << QByteArray("auth")
                           << QByteArray(R"({"username":"liming","password":"CANARY"})");
    QTest::newRow("list") << QByteArray("auth") << QByteArray(R"({"password":["CANARY",{"a":"CANARY"}]})");
    QTest::newRow("nested") << QByteArray("auth") << QByteArray(R"({"a":{"b":[{"Password":"CANARY"}]}})");
    QTest::newRow("broken JSON") << QByteArray("auth") << QByteArray(R"({"password":"CANARY")");
    QTest::newRow("array") << QByteArray("auth") << QByteArray(R"([{"password":"CANARY"}])");
    QTest::newRow("query") << QByteArray("auth?password=CANARY&a=b") << QByteArray();
}

void ManagementFaultsTest::journalHidesSecrets()
{
    QFETCH(QByteArray, target);
    QFETCH(QByteArray, body);
    begin("{}");
    m_server->enrolment().send("POST", "/uim/v3/client/" + target, body);
    const QString journal = m_server->journal().join(QLatin1Char('\n'));
    QVERIFY(journal.contains(QLatin1String("request POST /uim/v3/client/auth")));
    QVERIFY2(!journal.contains(QLatin1String("CANARY")), qPrintable(journal));
}

QTEST_GUILESS_MAIN(ManagementFaultsTest)
#include "tst_management_faults.moc"
