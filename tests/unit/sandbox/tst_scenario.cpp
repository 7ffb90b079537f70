// SPDX-License-Identifier: Apache-2.0
#include "scenario/scenario.h"

#include <QDir>
#include <QFile>
#include <QTemporaryDir>
#include <QtTest>

using namespace sandbox;

class ScenarioTest : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void everyPartArrives();
    void aScenarioThatSaysNothingBehaves();
    void slipsAreTold_data();
    void slipsAreTold();
    void boxes_data();
    void boxes();
    void shippedScenariosLoad_data();
    void shippedScenariosLoad();
    void unknownNameListsTheKnown();
    void missingFileIsTold();

private:
    std::optional<Scenario> read(const QByteArray &text, QString *error) const;

    QTemporaryDir m_folder;
};

std::optional<Scenario> ScenarioTest::read(const QByteArray &text, QString *error) const
{
    QFile file(m_folder.filePath(QStringLiteral("tried.json")));
    if (!file.open(QIODevice::WriteOnly) || file.write(text) != text.size())
        return std::nullopt;
    file.close();
    return Scenario::load(file.fileName(), error);
}

void ScenarioTest::everyPartArrives()
{
    QString error;
    const auto scenario = read(R"({
        "title": "All at once",
        "server": {"listen": false, "tls": false, "config": {"terminal_limit": 3},
                   "endpoints": {"join": {"status": 500, "json": {"b": 1, "a": "域"}, "delay_ms": 20,
                                          "fault": "half-header", "times": 2},
                                 "auth": {"body": "no"}}},
        "services": {"veskg": {"result": -3, "operations": {"copyConfig": {"error": "a.b", "vanish": true}}},
                     "iam": {"introspect": false}, "network": {"present": false, "reply": "null"}},
        "commands": {"id": {"exit": 1, "output": "uid=1000", "delay_ms": 5}},
        "schema": {"without": ["auto-login-visable"]},
        "files": {"/etc/hostname": null, "/usr/share/vesk/machine.txt": "", "/etc/vesk/userinfo.json": "{}"},
        "input": {"host": "h", "port": "1", "user": "u", "password": "p", "alias": "a",
                  "administrator": "root", "administrator_password": "q"},
        "expect": {"page": "account", "message": "m"}
    })",
                               &error);
    QVERIFY2(scenario, qPrintable(error));
    QCOMPARE(scenario->name(), QStringLiteral("tried"));
    QCOMPARE(scenario->title(), QStringLiteral("All at once"));
    QVERIFY(!scenario->serverListens());
    QVERIFY(!scenario->serverSpeaksTls());
    QCOMPARE(scenario->serverConfig().value(QStringLiteral("terminal_limit")).toInt(), 3);

    const EndpointScript join = scenario->endpoint(QStringLiteral("join"));
    QCOMPARE(join.status, std::optional(500));
    QCOMPARE(join.body, std::optional(QByteArray("{\"a\":\"域\",\"b\":1}")));
    QVERIFY(join.bodyIsJson);
    QCOMPARE(join.delayMs, 20);
    QVERIFY(join.fault == Fault::HalfHeader);
    QCOMPARE(join.times, 2);
    QVERIFY(!scenario->endpoint(QStringLiteral("auth")).bodyIsJson);

    const ServiceScript veskg = scenario->service(QStringLiteral("veskg"));
    QCOMPARE(veskg.operation(QStringLiteral("join")).result, std::optional(-3));
    QCOMPARE(veskg.operation(QStringLiteral("copyConfig")).error, std::optional(QStringLiteral("a.b")));
    QVERIFY(veskg.operation(QStringLiteral("copyConfig")).vanish);
    QVERIFY(!veskg.operation(QStringLiteral("copyConfig")).result);
    QVERIFY(!scenario->service(QStringLiteral("iam")).introspect);
    QVERIFY(!scenario->service(QStringLiteral("network")).present);
    QCOMPARE(scenario->command(QStringLiteral("id")).exitCode, std::optional(1));
    QCOMPARE(scenario->command(QStringLiteral("id")).output, std::optional(QStringLiteral("uid=1000")));
    QCOMPARE(scenario->schemaWithout(), QStringList{QStringLiteral("auto-login-visable")});

    const auto files = scenario->files();
    QVERIFY(files.value(QStringLiteral("/etc/hostname")).isNull());
    const QString machine = files.value(QStringLiteral("/usr/share/vesk/machine.txt"));
    QVERIFY(machine.isEmpty() && !machine.isNull());
    QCOMPARE(files.value(QStringLiteral("/etc/vesk/userinfo.json")), QStringLiteral("{}"));
    QCOMPARE(scenario->input().alias, QStringLiteral("a"));
    QCOMPARE(scenario->input().administratorPassword, QStringLiteral("q"));
    QCOMPARE(scenario->expectation().page, QStringLiteral("account"));
}

void ScenarioTest::aScenarioThatSaysNothingBehaves()
{
    QString error;
    const auto scenario = read(R"({"title": "Plain"})", &error);
    QVERIFY2(scenario, qPrintable(error));
    const EndpointScript join = scenario->endpoint(QStringLiteral("join"));
    QVERIFY(scenario->serverListens() && scenario->serverSpeaksTls());
    QVERIFY(!join.status && !join.body && join.fault == Fault::None && join.delayMs == 0);
    QVERIFY(scenario->service(QStringLiteral("iam")).present &&
            scenario->service(QStringLiteral("iam")).introspect);
    QCOMPARE(scenario->input().host, QStringLiteral("localhost"));
    QCOMPARE(scenario->expectation().page, QStringLiteral("success"));
    QVERIFY(scenario->expectation().boxes.isEmpty());
}

void ScenarioTest::slipsAreTold_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QString>("expected");

    QTest::newRow("empty") << QByteArray("") << QStringLiteral("line 1 is no JSON");
    QTest::newRow("cut off") << QByteArray("{\n\"title\": \"t\",\n") << QStringLiteral("line 3 is no JSON");
    QTest::newRow("array") << QByteArray("[]") << QStringLiteral("the top is not an object");
    QTest::newRow("no title") << QByteArray("{}") << QStringLiteral("\"title\" is missing");
    const auto slip = [](const char *name, const QByteArray &rest, const char *expected) {
        QTest::newRow(name) << QByteArray(R"({"title": "t", )" + rest + '}') << QString::fromUtf8(expected);
    };
    slip("key at the top", R"("sever": {})", "\"sever\" is unknown here");
    slip("key inside", R"("server": {"listens": true})", "\"server.listens\" is unknown here");
    slip("endpoint", R"("server": {"endpoints": {"joins": {}}})",
         "\"server.endpoints.joins\" is unknown; known are ca_cert");
    slip("service", R"("services": {"dns": {}})", "\"services.dns\" is unknown; known are network, veskg");
    slip("command", R"("commands": {"sudo": {}})", "\"commands.sudo\" is unknown");
    slip("operation", R"("services": {"veskg": {"operations": {"leave": {}}}})",
         "\"services.veskg.operations.leave\" is unknown");
    slip("key of another service", R"("services": {"login": {"introspect": true}})",
         "\"services.login.introspect\" is unknown here");
    slip("text for a flag", R"("server": {"listen": "yes"})", "\"server.listen\" is not true or false");
    slip("text for an object", R"("server": "on")", "\"server\" is not an object");
    slip("status out of range", R"("server": {"endpoints": {"join": {"status": 99}}})",
         "\"server.endpoints.join.status\" is not a whole number from 100 to 599");
    slip("half a millisecond", R"("server": {"endpoints": {"join": {"delay_ms": 0.5}}})",
         "\"server.endpoints.join.delay_ms\" is not a whole number");
    slip("endless delay", R"("commands": {"id": {"delay_ms": 600001}})", "\"commands.id.delay_ms\"");
    slip("never", R"("server": {"endpoints": {"join": {"times": 0}}})", "\"server.endpoints.join.times\"");
    slip("fault", R"("server": {"endpoints": {"join": {"fault": "explode"}}})",
         "\"server.endpoints.join.fault\" is none of close-before-reply, reset");
    slip("two bodies", R"("server": {"endpoints": {"join": {"body": "a", "json": {}}}})",
         "\"server.endpoints.join.json\" stands beside \"body\"");
    slip("relative path", R"("files": {"etc/hostname": ""})", "\"files.etc/hostname\" is no absolute path");
    slip("file as a number", R"("files": {"/etc/hostname": 1})",
         "\"files./etc/hostname\" is neither a text nor null");
    slip("schema keys", R"("schema": {"without": [1]})", "\"schema.without\" is not a list of texts");
    slip("page", R"("expect": {"page": "login"})", "\"expect.page\" is none of server, account");
    slip("repeated nothing", R"("expect": {"times": 2})", "\"expect.times\" has no \"message\"");
}

void ScenarioTest::slipsAreTold()
{
    QFETCH(QByteArray, text);
    QFETCH(QString, expected);

    QString error;
    QVERIFY(!read(text, &error));

    QVERIFY2(error.startsWith(m_folder.filePath(QStringLiteral("tried.json: "))), qPrintable(error));
    QVERIFY2(error.contains(expected), qPrintable(error));
    QVERIFY(!error.contains(QLatin1Char('\n')));
}

void ScenarioTest::boxes_data()
{
    const auto list = [](const char *words) {
        return QString::fromLatin1(words).split(QLatin1Char(' '));
    };
    QTest::addColumn<QByteArray>("expect");
    QTest::addColumn<QStringList>("boxes");

    QTest::newRow("none") << QByteArray("{}") << QStringList();
    QTest::newRow("one") << QByteArray(R"({"message": "a"})") << list("a");
    QTest::newRow("without text") << QByteArray(R"({"message": ""})") << list("");
    QTest::newRow("twice") << QByteArray(R"({"message": "a", "times": 2})") << list("a a");
    QTest::newRow("different") << QByteArray(R"({"messages": ["a", "b"]})") << list("a b");
}

void ScenarioTest::boxes()
{
    QFETCH(QByteArray, expect);
    QFETCH(QStringList, boxes);

    QString error;
    const auto scenario = read(R"({"title": "t", "expect": )" + expect + '}', &error);

    QVERIFY2(scenario, qPrintable(error));
    QCOMPARE(scenario->expectation().boxes, boxes);
}

void ScenarioTest::shippedScenariosLoad_data()
{
    QTest::addColumn<QString>("name");
    const QStringList names = Scenario::names(Scenario::standardFolder());
    for (const QString &name : names)
        QTest::newRow(qPrintable(name)) << name;
}

void ScenarioTest::shippedScenariosLoad()
{
    QFETCH(QString, name);
    QString error;
    const auto scenario = Scenario::find(name, Scenario::standardFolder(), &error);
    QVERIFY2(scenario, qPrintable(error));
    QCOMPARE(scenario->name(), name);
}

void ScenarioTest::unknownNameListsTheKnown()
{
    QString error;
    QVERIFY(!Scenario::find(QStringLiteral("join-okay"), Scenario::standardFolder(), &error));
    QVERIFY2(error.contains(QLatin1String("join-okay")) && error.contains(QLatin1String("join-ok,")),
             qPrintable(error));

    QVERIFY(!Scenario::find(QStringLiteral("join-ok"), m_folder.filePath(QStringLiteral("none")), &error));
    QVERIFY2(error.contains(QLatin1String("there are none in")), qPrintable(error));
}

void ScenarioTest::missingFileIsTold()
{
    QString error;
    QVERIFY(!Scenario::find(QStringLiteral("./absent.json"), Scenario::standardFolder(), &error));
    QVERIFY2(error.startsWith(QLatin1String("./absent.json: cannot be read: ")), qPrintable(error));
}

QTEST_GUILESS_MAIN(ScenarioTest)
#include "tst_scenario.moc"
