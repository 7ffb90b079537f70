// SPDX-License-Identifier: Apache-2.0
#include "desk.h"

#include <QImage>
#include <QtTest>

#include <optional>

namespace {

const QString kScenario = QStringLiteral("SCENARIO"); // stands for the file in a row's arguments

void write(const QString &path, const QByteArray &text)
{
    QFile file(path);
    QVERIFY(file.open(QIODevice::WriteOnly) && file.write(text) == text.size());
}

} // namespace

class TestAutopilot : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase();
    void cleanupTestCase() { m_desk.reset(); }
    void pictures_data();
    void pictures();
    void refusal_data();
    void refusal();
    void busWithoutAccessibility();

private:
    int run(const QStringList &arguments, const QProcessEnvironment &environment, QString *complaint) const;

    std::optional<Desk> m_desk;
    QTemporaryDir m_folder;
    QString m_scenario;
};

void TestAutopilot::initTestCase()
{
    m_desk.emplace();
    m_scenario = m_folder.filePath(QStringLiteral("refused.json"));
    write(m_scenario, R"({"title": "The alias is refused",
                          "expect": {"page": "alias", "message": "别名已存在"}})");
}

// Runs the program; `complaint` is what it says on standard error.
int TestAutopilot::run(const QStringList &arguments, const QProcessEnvironment &environment,
                       QString *complaint) const
{
    QStringList words = arguments;
    words.replaceInStrings(kScenario, m_scenario);
    QProcess autopilot;
    autopilot.setProcessEnvironment(environment);
    autopilot.start(QStringLiteral(AUTOPILOT), words);
    const bool hasEnded = autopilot.waitForFinished(60000) && autopilot.exitStatus() == QProcess::NormalExit;
    *complaint = QString::fromUtf8(autopilot.readAllStandardError());
    return hasEnded ? autopilot.exitCode() : -1;
}

void TestAutopilot::pictures_data()
{
    QTest::addColumn<QString>("scale");
    QTest::newRow("100 %") << QStringLiteral("1");
    QTest::newRow("200 %") << QStringLiteral("2");
}

void TestAutopilot::pictures()
{
    QFETCH(const QString, scale);
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("QT_SCALE_FACTOR"), scale);
    QProcess wizard;
    wizard.setProcessEnvironment(environment);
    wizard.start(QStringLiteral(WIZARD), {QStringLiteral("--box"), QStringLiteral("alias=别名已存在")});
    const QDir pictures(m_folder.filePath(scale));
    QString complaint;
    const int code = run({QStringLiteral("join"), QStringLiteral("--scenario"), kScenario,
                          QStringLiteral("--port"), QStringLiteral("8443"), QStringLiteral("--program"),
                          QStringLiteral("autopilot-wizard"), QStringLiteral("--pictures"), pictures.path(),
                          QStringLiteral("--timeout"), QStringLiteral("30")},
                         environment, &complaint);
    wizard.kill();
    wizard.waitForFinished();
    QVERIFY2(code == 0, qPrintable(complaint));

    const QStringList files = pictures.entryList(QDir::Files, QDir::Name);
    QCOMPARE(files, QStringList({QStringLiteral("1-server.png"), QStringLiteral("2-account.png"),
                                 QStringLiteral("3-alias-box.png"), QStringLiteral("3-alias.png")}));
    QList<QImage> seen;
    for (const QString &file : files) {
        const QImage picture(pictures.filePath(file));
        QVERIFY2(!seen.contains(picture),
                 qPrintable(file + QStringLiteral(" shows what another picture shows")));
        if (!file.contains(QStringLiteral("box")))
            QCOMPARE(picture.width(), 380 * scale.toInt());
        seen.append(picture);
    }
}

void TestAutopilot::refusal_data()
{
    QTest::addColumn<QString>("arguments"); // separated by blanks
    QTest::addColumn<QString>("variable");  // NAME=VALUE laid over the environment, or empty
    QTest::addColumn<QString>("complaint"); // how it begins
    const auto row = [](const char *name, const char *arguments, const char *variable,
                        const char *complaint) {
        QTest::newRow(name) << QString::fromLatin1(arguments) << QString::fromLatin1(variable)
                            << QString::fromLatin1(complaint);
    };
    row("no journey", "--scenario SCENARIO", "", "say join or leave, not \"\"");
    row("two journeys", "join leave", "", "say join or leave, not \"join leave\"");
    row("unknown option", "join --fast", "", "Unknown option 'fast'.");
    row("no time at all", "join --timeout 0", "", "--timeout takes a number from 1 to 3600, not \"0\"");
    row("no port of TCP", "join --port 65536", "", "--port takes a number from 1 to 65535, not \"65536\"");
    row("no port known", "join --scenario SCENARIO", "", "the scenario SCENARIO names no port");
    row("world without a configuration", "join --state /nowhere", "",
        "cannot read the port in /nowhere/server/config.json: ");
    row("no session bus", "leave --scenario SCENARIO", "DBUS_SESSION_BUS_ADDRESS=unix:path=/nowhere",
        "no session bus: ");
    row("no display", "leave --scenario SCENARIO --pictures x", "DISPLAY=:9999",
        "pictures need the display of the program, but DISPLAY is \":9999\"");
    row("no program", "leave --scenario SCENARIO --timeout 1", "",
        "the program does not publish its accessibility tree: looked for ");
}

void TestAutopilot::refusal()
{
    QFETCH(const QString, arguments);
    QFETCH(const QString, variable);
    QFETCH(QString, complaint);
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    if (!variable.isEmpty())
        environment.insert(variable.section(QLatin1Char('='), 0, 0), variable.section(QLatin1Char('='), 1));

    QString said;
    QCOMPARE(run(arguments.split(QLatin1Char(' ')), environment, &said), 1);
    complaint.replace(kScenario, m_scenario).prepend(QStringLiteral("vesk-autopilot: "));
    QVERIFY2(said.startsWith(complaint), qPrintable(said));
    QCOMPARE(said.count(QLatin1Char('\n')), 1);
}

void TestAutopilot::busWithoutAccessibility()
{
    const QString config = m_folder.filePath(QStringLiteral("bare.conf"));
    const QString text =
        QStringLiteral("<busconfig><listen>unix:dir=%1</listen><policy context='default'>"
                       "<allow user='*'/><allow own='*'/><allow eavesdrop='true'/>"
                       "<allow send_destination='*' eavesdrop='true'/></policy></busconfig>");
    write(config, text.arg(m_desk->folder()).toUtf8());
    QProcess bus;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"),
                       Desk::startServer(bus, QStringLiteral("dbus-daemon"),
                                         {QStringLiteral("--config-file=") + config,
                                          QStringLiteral("--nofork"), QStringLiteral("--print-address")}));
    QString said;
    QCOMPARE(run({QStringLiteral("leave"), QStringLiteral("--scenario"), kScenario}, environment, &said), 1);
    bus.terminate();
    bus.waitForFinished();
    QVERIFY2(said.startsWith(QStringLiteral("vesk-autopilot: no accessibility bus: ")), qPrintable(said));
}

QTEST_GUILESS_MAIN(TestAutopilot)
#include "tst_autopilot.moc"
