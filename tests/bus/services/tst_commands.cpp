// SPDX-License-Identifier: Apache-2.0
#include "servicefixture.h"

#include "journal/hold.h"

#include <QElapsedTimer>
#include <QJsonDocument>
#include <QJsonObject>
#include <QProcess>
#include <QtTest>

using namespace sandbox;

namespace {

struct Result
{
    int exitCode = -1;
    QString output;
};

Result run(const ServiceFixture &fixture, const QString &line)
{
    const QStringList words = line.split(QLatin1Char(' '), Qt::SkipEmptyParts);
    QProcess process;
    process.setProcessChannelMode(QProcess::MergedChannels);
    process.setProcessEnvironment(fixture.environment());
    process.start(fixture.state().commands() + QLatin1Char('/') + words.first(), words.mid(1));
    if (!process.waitForFinished(20000))
        return {-1, process.errorString()};
    return {process.exitCode(), QString::fromUtf8(process.readAll())};
}

} // namespace

// The stand-ins for the commands that the program starts.
class TestCommands : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void runsAndIsJournalled_data();
    void runsAndIsJournalled();
    void scenarioDecides_data();
    void scenarioDecides();
    void waitsForItsRelease();
    void settingsAreTheWorlds();
    void unitsAreKept();
    void unitsSurviveParallelWrites();
    void refusesOutsideOfAWorld();
};

void TestCommands::runsAndIsJournalled_data()
{
    QTest::addColumn<QString>("line");
    QTest::addColumn<int>("exitCode");
    QTest::addColumn<QString>("output"); // part of it
    const auto row = [](const char *line, int exitCode, const char *output) {
        QTest::newRow(line) << QString::fromUtf8(line) << exitCode << QString::fromUtf8(output);
    };
    row("id", 0, "(sudo),990(vesk)");
    row("killall -9 mmcs", 1, "mmcs: no process found");
    row("systemctl --global enable vesks", 0, "");
    row("systemctl --global stop mmcs", 0, "");
    row("systemctl --global enable sshd", 1, "Unit file sshd.service does not exist");
    row("systemctl reboot", 1, "usage");
    row("systemctl --global mask vesks", 1, "Unknown command verb mask");
    row("gsettings get com.morvek.mde.control-center auto-login-visable", 0, "true");
    row("gsettings get com.example.missing key", 1, "com.example.missing");
}

void TestCommands::runsAndIsJournalled()
{
    QFETCH(QString, line);
    QFETCH(int, exitCode);
    QFETCH(QString, output);
    const ServiceFixture fixture;
    const Result result = run(fixture, line);
    QVERIFY2(result.exitCode == exitCode && result.output.contains(output), qPrintable(result.output));
    QCOMPARE(fixture.journal(),
             QStringList{QStringLiteral("command   %1 -> exit %2").arg(line).arg(exitCode)});
}

void TestCommands::scenarioDecides_data()
{
    QTest::addColumn<QByteArray>("script");
    QTest::addColumn<int>("exitCode");
    QTest::addColumn<QString>("output");
    QTest::addColumn<int>("milliseconds"); // at least
    QTest::newRow("without rights") << QByteArray(R"({"output": "uid=7(x)\n"})") << 0
                                    << QStringLiteral("uid=7(x)\n") << 0;
    QTest::newRow("fails") << QByteArray(R"({"exit": 9})") << 9 << QString() << 0;
    QTest::newRow("slow") << QByteArray(R"({"exit": 0, "delay_ms": 400})") << 0 << QString() << 400;
}

void TestCommands::scenarioDecides()
{
    QFETCH(QByteArray, script);
    QFETCH(int, exitCode);
    QFETCH(QString, output);
    QFETCH(int, milliseconds);
    const ServiceFixture fixture("{\"commands\": {\"id\": " + script + "}}");
    QElapsedTimer timer;
    timer.start();
    const Result result = run(fixture, QStringLiteral("id"));
    QCOMPARE(result.exitCode, exitCode);
    QCOMPARE(result.output, output);
    QVERIFY(timer.elapsed() >= milliseconds);
}

void TestCommands::waitsForItsRelease()
{
    const ServiceFixture fixture(R"({"commands": {"id": {"hold": true}}})");
    Hold hold(fixture.state().journal());
    QVERIFY(hold.create());
    QProcess process;
    process.setProcessEnvironment(fixture.environment());
    process.start(fixture.state().commands() + QStringLiteral("/id"), QStringList());
    QTRY_COMPARE_WITH_TIMEOUT(fixture.journal(), QStringList{QStringLiteral("command   id: is held for now")},
                              20000);
    hold.release();
    QVERIFY(process.waitForFinished(20000));
    QCOMPARE(fixture.journal().last(), QStringLiteral("command   id -> exit 0"));
    hold.release(); // before its call
    QCOMPARE(run(fixture, QStringLiteral("id")).exitCode, 0);
}

void TestCommands::settingsAreTheWorlds()
{
    const ServiceFixture fixture;
    const QString key = QStringLiteral("com.morvek.mde.control-center auto-login-visable");
    QCOMPARE(run(fixture, QStringLiteral("gsettings set %1 false").arg(key)).exitCode, 0);
    QCOMPARE(run(fixture, QStringLiteral("gsettings get %1").arg(key)).output, QStringLiteral("false\n"));
    QVERIFY(
        ServiceFixture::read(fixture.state().home() + QStringLiteral("/.config/glib-2.0/settings/keyfile"))
            .contains("auto-login-visable=false"));
}

void TestCommands::unitsAreKept()
{
    const ServiceFixture fixture;
    const auto state = [&] {
        return run(fixture, QStringLiteral("systemctl --global is-enabled mmcs")).output;
    };
    QCOMPARE(state(), QStringLiteral("disabled\n"));
    run(fixture, QStringLiteral("systemctl --global enable mmcs"));
    QCOMPARE(state(), QStringLiteral("enabled\n"));
    run(fixture, QStringLiteral("systemctl --global disable mmcs"));
    QCOMPARE(state(), QStringLiteral("disabled\n"));
}

// The client starts four of them at once when it leaves.
void TestCommands::unitsSurviveParallelWrites()
{
    const ServiceFixture fixture;
    std::vector<std::unique_ptr<QProcess>> processes;
    for (int i = 0; i < 8; ++i) {
        processes.push_back(std::make_unique<QProcess>());
        processes.back()->setProcessEnvironment(fixture.environment());
        processes.back()->start(fixture.state().commands() + QStringLiteral("/systemctl"),
                                {QStringLiteral("--global"), QStringLiteral("enable"),
                                 i % 2 == 0 ? QStringLiteral("vesks") : QStringLiteral("mmcs")});
    }
    for (const auto &process : processes)
        QVERIFY(process->waitForFinished() && process->exitCode() == 0);
    const QJsonObject units = QJsonDocument::fromJson(ServiceFixture::read(fixture.state().units())).object();
    QCOMPARE(units.keys(), (QStringList{QStringLiteral("mmcs"), QStringLiteral("vesks")}));
}

void TestCommands::refusesOutsideOfAWorld()
{
    const ServiceFixture fixture;
    QProcess process;
    process.start(fixture.state().commands() + QStringLiteral("/killall"),
                  {QStringLiteral("-9"), QStringLiteral("mmcs")});
    QVERIFY(process.waitForFinished());
    QCOMPARE(process.exitCode(), 125);
    QCOMPARE(process.readAllStandardError(),
             QByteArray("killall: stands in for the real command inside a world only\n"));
}

QTEST_GUILESS_MAIN(TestCommands)
#include "tst_commands.moc"
