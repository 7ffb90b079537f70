// SPDX-License-Identifier: Apache-2.0
#include "serverfixture.h"

#include <QTcpServer>
#include <QtTest>

namespace {

const char *const kServer = R"({"config": {
    "accounts": [{"name": "liming", "password": "Terminal-7"},
                 {"name": "zhaoyu", "password": "Holiday-3", "locked": true}],
    "known_terminals": [{"machine_id": "known", "name": "taken"}]
}})";

} // namespace

// What each endpoint answers to good and bad requests.
class ManagementEndpointsTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase();
    void replies_data();
    void replies();
    void wrongMethodNamesTheRightOne();
    void caIsTheOneThatVerifies();
    void ruleIsJsonInJson();
    void everyNameIsServed_data();
    void everyNameIsServed();

private:
    ServerFixture m_server{kServer};
};

void ManagementEndpointsTest::initTestCase()
{
    QCOMPARE(m_server.start(), QString());
}

void ManagementEndpointsTest::replies_data()
{
    QTest::addColumn<QByteArray>("request"); // method, target below the usual path, body
    QTest::addColumn<int>("status");
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("msg");
    const auto row = [](const char *name, const char *request, int status, int code, const char *msg) {
        QTest::newRow(name) << QByteArray(request) << status << code << QString::fromUtf8(msg);
    };
    row("join, unknown terminal", "GET status?machine_id=new&keyword=join", 200, 0, "");
    row("join, known terminal", "GET status?machine_id=known&keyword=join", 200, 0, "终端已加域");
    row("remove, known terminal", "GET status?machine_id=known&keyword=remove&username=u", 200, 0, "");
    row("remove, unknown terminal", "GET status?machine_id=new&keyword=remove", 200, 0, "终端未加域");
    row("no machine identity", "GET status?machine_id=&keyword=join", 400, 40002, "请求缺少字段：machine_id");
    row("identity that is a path", "GET status?machine_id=..%2Fx&keyword=join", 400, 40003,
        "字段的值无效：machine_id");
    row("no keyword", "GET status?machine_id=new", 400, 40002, "请求缺少字段：keyword");
    row("other keyword", "GET status?machine_id=new&keyword=x", 400, 40003, "字段的值无效：keyword");

    row("right password", "POST auth {\"username\":\"liming\",\"password\":\"Terminal-7\"}", 200, 0, "");
    row("wrong password", "POST auth {\"username\":\"liming\",\"password\":\"terminal-7\"}", 200, 10001,
        "帐号或密码错误");
    row("unknown account", "POST auth {\"username\":\"nobody\",\"password\":\"Terminal-7\"}", 200, 10001,
        "帐号或密码错误");
    row("locked account", "POST auth {\"username\":\"zhaoyu\",\"password\":\"Holiday-3\"}", 200, 10002,
        "帐号已被锁定，请联系管理员");
    row("locked, wrong password", "POST auth {\"username\":\"zhaoyu\",\"password\":\"x\"}", 200, 10001,
        "帐号或密码错误");
    row("no password", "POST auth {\"username\":\"liming\"}", 400, 40002, "请求缺少字段：password");
    row("password as a number", "POST auth {\"username\":\"liming\",\"password\":7}", 400, 40002,
        "请求缺少字段：password");
    row("broken JSON", "POST auth {\"username\":", 400, 40001, "请求内容不是有效的JSON对象");
    row("JSON array", "POST auth [1]", 400, 40001, "请求内容不是有效的JSON对象");
    row("no body", "POST auth", 400, 40001, "请求内容不是有效的JSON对象");

    row("free alias, GET with a body", "GET pc/verify/name {\"pc_name\":\"free\"}", 200, 0, "");
    row("taken alias", "GET pc/verify/name {\"pc_name\":\"taken\"}", 200, 10006, "终端别名已被使用");
    row("alias of 33 characters", "GET pc/verify/name {\"pc_name\":\"123456789012345678901234567890123\"}",
        200, 10007, "终端别名应为1到32个字符");
    row("rule of something else", "GET config?key=ssh_port", 400, 40003, "字段的值无效：key");

    row("join without a hardware address",
        "POST join {\"machine_id\":\"m\",\"name\":\"n\",\"username\":\"liming\"}", 400, 40002,
        "请求缺少字段：mac");
    row("join by a locked account",
        "POST join {\"machine_id\":\"m\",\"name\":\"n\",\"username\":\"zhaoyu\",\"mac\":\"\"}", 200, 10002,
        "帐号已被锁定，请联系管理员");
    row("join by nobody", "POST join {\"machine_id\":\"m\",\"name\":\"n\",\"username\":\"x\",\"mac\":\"\"}",
        200, 10003, "帐号不存在");
    row("join under a taken alias",
        "POST join {\"machine_id\":\"m\",\"name\":\"taken\",\"username\":\"liming\",\"mac\":\"\"}", 200,
        10006, "终端别名已被使用");
    row("join of a known terminal",
        "POST join {\"machine_id\":\"known\",\"name\":\"n\",\"username\":\"liming\",\"mac\":\"\"}", 400,
        10008, "服务器已有此终端");
    row("join with a path for an identity",
        "POST join {\"machine_id\":\"../ca\",\"name\":\"n\",\"username\":\"liming\",\"mac\":\"\"}", 400,
        40003, "字段的值无效：machine_id");

    row("removal without a certificate", "POST remove {}", 403, 40301, "该接口只在终端的受管地址提供");
    row("unknown path", "GET statuses", 404, 40400, "接口不存在");
    row("wrong method", "POST status?machine_id=new&keyword=join", 405, 40500, "请求方法不允许");
    row("unknown method", "BREW join {}", 405, 40500, "请求方法不允许");
}

void ManagementEndpointsTest::replies()
{
    QFETCH(QByteArray, request);
    const QList<QByteArray> words = request.split(' ');

    const auto answer =
        m_server.enrolment().send(words.at(0), "/uim/v3/client/" + words.at(1), words.value(2));

    QCOMPARE(answer.trouble, QByteArray());
    QTEST(answer.status, "status");
    QTEST(answer.code(), "code");
    QTEST(answer.msg(), "msg");
    QVERIFY(answer.header.contains("Content-Type: application/json; charset=utf-8\r\n"));
    if (request.contains(" status?") && answer.status == 200)
        QCOMPARE(answer.data().value(QStringLiteral("result")).toBool(), answer.msg().isEmpty());
}

void ManagementEndpointsTest::wrongMethodNamesTheRightOne()
{
    QVERIFY(m_server.enrolment().send("GET", "/uim/v3/client/join").header.contains("Allow: POST\r\n"));
}

void ManagementEndpointsTest::caIsTheOneThatVerifies()
{
    const auto answer = m_server.enrolment().send("GET", "/apiauth/v1/client/ca_cert");
    const QString text = answer.data().value(QStringLiteral("ca_cert")).toString();
    QCOMPARE(QByteArray::fromBase64(text.toLatin1()), m_server.read(QStringLiteral("ca.crt")));
}

void ManagementEndpointsTest::ruleIsJsonInJson()
{
    const auto answer = m_server.enrolment().send("GET", "/uim/v3/client/config?key=pc_name_rules");
    const QByteArray expected = R"({"code":0,"message":"{\"regular_expression\":\"[A-Za-z0-9-]+\"}"})";
    QCOMPARE(answer.body, expected);
}

void ManagementEndpointsTest::everyNameIsServed_data()
{
    QTest::addColumn<QString>("host");
    QTest::newRow("name") << QStringLiteral("localhost");
    QTest::newRow("IPv4") << QStringLiteral("127.0.0.1");
    QTcpServer probe;
    if (probe.listen(QHostAddress::LocalHostIPv6))
        QTest::newRow("IPv6") << QStringLiteral("[::1]");
}

void ManagementEndpointsTest::everyNameIsServed()
{
    WebClient client = m_server.enrolment();
    QFETCH(QString, host);
    client.host = host;
    const auto answer = client.send("GET", "/apiauth/v1/client/ca_cert");
    QCOMPARE(answer.trouble, QByteArray());
    QCOMPARE(answer.code(), 0);
}

QTEST_GUILESS_MAIN(ManagementEndpointsTest)
#include "tst_management_endpoints.moc"
