// SPDX-License-Identifier: Apache-2.0
#include "desk.h"
#include "trouble.h"
#include "walk.h"

#include <QtTest>

using namespace sandbox;

namespace {

struct Case
{
    QString arguments; // of the wizard, separated by blanks
    Journey journey = Journey::Join;
    QString page;
    QStringList boxes;
    QString pressed; // what the wizard tells, a "|" after each press; empty means: does not matter
    QString trouble; // how it begins; empty means: all as expected
};

QStringList words(const QString &line)
{
    return line.split(QLatin1Char(' '), Qt::SkipEmptyParts);
}

} // namespace

Q_DECLARE_METATYPE(Case)

class TestWalk : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase() { m_desk.emplace(); }
    void cleanupTestCase() { m_desk.reset(); }
    void journey_data();
    void journey();
    void passwordStaysSecret();

private:
    static QString walk(const Case &scene, const QString &journal = {});
    static QString walkThrough(const Case &scene, const QString &journal);

    std::optional<Desk> m_desk;
};

void TestWalk::journey_data()
{
    QTest::addColumn<Case>("scene");
    const auto row = [](const char *name, Journey journey, const char *arguments, const char *page,
                        const QStringList &boxes, const char *pressed, const char *trouble = "") {
        QTest::newRow(name) << Case{QString::fromUtf8(arguments), journey,
                                    QString::fromUtf8(page),      boxes,
                                    QString::fromUtf8(pressed),   QString::fromUtf8(trouble)};
    };
    const auto join = Journey::Join;
    const auto leave = Journey::Leave;
    const QString no = QStringLiteral("坏");
    const QString never = QStringLiteral("甲");

    row("join", join, "", "success", {},
        "server localhost 8443|account liming Terminal-7|alias kept|summary|success|");
    row("presses that block for longer than a call waits", join, "--busy 2500 --from summary", "success", {},
        "summary|success|");
    row("refused", join, "--box account=坏", "account", {no},
        "server localhost 8443|account liming Terminal-7|确定|");
    row("refused without words", join, "--from alias --box alias=", "alias", {QString()}, "alias kept|确定|");
    row("refused twice, each time after a press", join, "--from account --box account=坏 --box account=甲",
        "account", {no, never}, "account liming Terminal-7|确定|account liming Terminal-7|确定|");
    row("second attempt", join, "--from summary --box summary=坏", "success", {no},
        "summary|确定|summary|success|");
    row("leave", leave, "--from leave", "success", {}, "leave|授权 admin Control-9|removed|");
    row("two boxes after one press", leave, "--from leave --box leave=坏 --then leave=坏", "leave", {no, no},
        "leave|确定|确定|");
    row("calls before each of two boxes", leave, "--from leave --call 1000 --box leave=坏 --then leave=坏",
        "leave", {no, no}, "leave|确定|确定|");
    row("press without effect, as expected", leave, "--from leave --mute leave", "leave", {}, "leave|");
    row("joined already, as expected", join, "--from leave", "leave", {}, "");

    row("other words", join, "--from account --box account=坏", "account", {never}, "",
        "the message box says \"坏\", expected \"甲\"");
    row("box that nobody expected", join, "--box server=坏", "success", {}, "",
        "the message box \"坏\" came, expected page success");
    row("one box too many", join, "--box server=坏 --then server=甲", "server", {no}, "",
        "the message box \"甲\" came, expected page server after \"坏\"");
    row("box that comes late", leave, "--from leave --call 4000 --box leave=坏", "leave", {}, "",
        "the message box \"坏\" came, expected page leave");
    row("box that comes long after another", leave, "--from leave --call 2000 --box leave=坏 --then leave=甲",
        "leave", {no}, "", "the message box \"甲\" came, expected page leave after \"坏\"");
    row("box that never comes", join, "--from alias", "alias", {no}, "",
        "the program stands on page success");
    row("joined already", join, "--from leave", "success", {}, "", "the program stands on page leave");
    row("disabled button", join, "--dead server", "success", {}, "",
        "the page server never lets 下一步 be pressed");
    row("press without effect", join, "--from alias --mute alias", "success", {}, "",
        "out of time: the program stands on page alias");
    row("end of the program", join, "--from account --quit account", "success", {}, "",
        "the program has ended");
}

void TestWalk::journey()
{
    QFETCH(const Case, scene);
    const QString trouble = walk(scene);
    QVERIFY2(scene.trouble.isEmpty() == trouble.isEmpty(), qPrintable(trouble));
    QVERIFY2(trouble.left(scene.trouble.size()) == scene.trouble, qPrintable(trouble));
}

// Lets the wizard run until the walk is over; gives what went wrong, or an empty text.
QString TestWalk::walk(const Case &scene, const QString &journal)
{
    QProcess wizard;
    wizard.setProcessChannelMode(QProcess::ForwardedErrorChannel);
    wizard.start(QStringLiteral(WIZARD), words(scene.arguments));
    QString trouble = walkThrough(scene, journal);
    wizard.kill();
    wizard.waitForFinished();
    const QString pressed =
        QString::fromUtf8(wizard.readAllStandardOutput()).replace(QLatin1Char('\n'), QLatin1Char('|'));
    if (trouble.isEmpty() && !scene.pressed.isEmpty() && pressed != scene.pressed)
        return QStringLiteral("pressed ") + pressed;
    return trouble;
}

QString TestWalk::walkThrough(const Case &scene, const QString &journal)
{
    const bool runsOut = scene.trouble.contains(QStringLiteral("out of time")) ||
                         scene.trouble.contains(QStringLiteral("never"));
    const QDeadlineTimer deadline(runsOut ? 12000 : 60000);
    ScenarioInput input;
    input.port = QStringLiteral("8443");
    const ScenarioExpectation expectation = {scene.page, scene.boxes};
    const Logbook logbook(journal);
    const Camera camera{QString()};
    try {
        const AccessibleTree tree(QStringLiteral("autopilot-wizard"), deadline);
        Walk(scene.journey, input, expectation, tree, logbook, camera, deadline).run();
    } catch (const Trouble &trouble) {
        return trouble.text();
    }
    return {};
}

void TestWalk::passwordStaysSecret()
{
    const QTemporaryDir folder;
    QFile journal(folder.filePath(QStringLiteral("journal.log")));
    Case scene;
    scene.page = QStringLiteral("success");
    QCOMPARE(walk(scene, journal.fileName()), QString());
    QVERIFY(journal.open(QIODevice::ReadOnly));
    const QString text = QString::fromUtf8(journal.readAll());
    QVERIFY(text.contains(QStringLiteral(" autopilot type  域地址 = localhost\n")));
    QVERIFY(text.contains(QStringLiteral(" autopilot type  密码 = ***\n")));
    QVERIFY(!text.contains(QStringLiteral("Terminal-7")));
}

QTEST_GUILESS_MAIN(TestWalk)
#include "tst_walk.moc"
