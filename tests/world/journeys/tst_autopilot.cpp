// SPDX-License-Identifier: Apache-2.0
#include "worldrun.h"

// A wrong expectation of the real program in a real world must fail, and with the right words.
class TestAutopilot : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void wrongExpectation_data();
    void wrongExpectation();
    void refusal_data();
    void refusal();
};

void TestAutopilot::wrongExpectation_data()
{
    QTest::addColumn<QByteArray>("journey");
    QTest::addColumn<QByteArray>("scenario");
    QTest::addColumn<QByteArray>("said");
    const auto row = [](const char *name, const char *journey, const char *scenario, const char *said) {
        QTest::newRow(name) << QByteArray(journey) << QByteArray(scenario) << QByteArray(said);
    };
    row("other words", "join",
        R"({"title": "t", "input": {"password": "no"}, "expect": {"page": "account", "message": "甲"}})",
        "the message box says \"帐号或密码错误\", expected \"甲\"");
    row("unexpected message box", "join",
        R"({"title": "t", "input": {"password": "no"}, "expect": {"page": "account"}})",
        "the message box \"帐号或密码错误\" came, expected page account");
    row("missing message box", "join", R"({"title": "t", "expect": {"page": "account", "message": "甲"}})",
        "the program stands on page success (终端已成功加入域管,重启电脑生效) after 0 message boxes, "
        "expected page account after \"甲\"");
    row("page that never comes", "leave", R"({"title": "t", "expect": {"page": "success"}})",
        "the program stands on page server (服务器配置) after 0 message boxes, expected page success");
}

void TestAutopilot::wrongExpectation()
{
    QFETCH(QByteArray, journey);
    QFETCH(QByteArray, scenario);
    QFETCH(QByteArray, said);
    WorldRun world;
    QTemporaryFile file(QDir::tempPath() + QStringLiteral("/XXXXXX.json"));
    QVERIFY(file.open() && file.write(scenario) == scenario.size() && file.flush());
    QCOMPARE(world.play(journey.constData(), file.fileName().toUtf8().constData()), 1);
    const QByteArray line = "fail  " + said + '\n';
    QVERIFY2(world.output().contains(line), world.output().constData());
    QVERIFY2(world.journal().contains(" autopilot " + line), world.journal().constData());
}

void TestAutopilot::refusal_data()
{
    QTest::addColumn<QByteArray>("said");
    const auto row = [](const char *arguments, const char *said) {
        QTest::newRow(arguments) << QByteArray(said);
    };
    row("join leave", "the journey is join or leave, not \"join leave\"\n");
    row("join --fast", "Unknown option 'fast'.\n");
    row("join --timeout 0", "--timeout takes a number from 1 to 3600\n");
    row("join --state /nowhere", "no port is known: give the world with --state\n");
    row("leave --timeout 1", "no bus at \"unix:path=/nowhere\": ");
}

void TestAutopilot::refusal()
{
    QFETCH(QByteArray, said);
    QProcess autopilot;
    autopilot.start(QStringLiteral("env"),
                    QStringList{QStringLiteral("DBUS_SESSION_BUS_ADDRESS=unix:path=/nowhere"),
                                QStringLiteral("DISPLAY=:9999"), QStringLiteral(VESK_AUTOPILOT)} +
                        QString::fromLatin1(QTest::currentDataTag()).split(QLatin1Char(' ')));
    QVERIFY(autopilot.waitForFinished());
    QCOMPARE(autopilot.exitCode(), 1);
    const QByteArray errors = autopilot.readAllStandardError();
    QVERIFY2(errors.startsWith("vesk-autopilot: " + said), errors.constData());
}

QTEST_GUILESS_MAIN(TestAutopilot)
#include "tst_autopilot.moc"
