// SPDX-License-Identifier: Apache-2.0
#include "accessibletree.h"
#include "waitfor.h"
#include "world/child.h"
#include "world/world.h"
#include "worldrun.h"

#include <QDBusVariant>
#include <QFile>
#include <QTest>
#include <QThread>

#include <algorithm>
#include <functional>
#include <future>

using namespace sandbox;

namespace {

constexpr int kLimitMs = 60000;

constexpr unsigned kHoldMs = 4000;

const QString kNext = QStringLiteral("下一步");
const QString kAdminPassword = QStringLiteral("Control-9");
const QString kWrongPassword = QStringLiteral("Wr0ng-One");

using Script = std::function<void(const AccessibleTree &tree)>;

QDeadlineTimer soon()
{
    return QDeadlineTimer(kLimitMs);
}

// Waits for a window that has an enabled button and gives the button.
Element button(const AccessibleTree &tree, const QString &text)
{
    return *waitFor(soon(), text + QStringLiteral(" cannot be pressed"), [&]() -> std::optional<Element> {
        for (const Element &window : tree.windows()) {
            const Element *found = window.button(text);
            if (found != nullptr && found->enabled)
                return *found;
        }
        return std::nullopt;
    });
}

void type(const AccessibleTree &tree, const QString &caption, const QString &text)
{
    waitFor(soon(), caption + QStringLiteral(" does not show"), [&] {
        for (const Element &window : tree.windows()) {
            if (const Element *edit = window.edit(caption)) {
                tree.type(*edit, text);
                return true;
            }
        }
        return false;
    });
}

std::size_t dialogs(const std::vector<Element> &windows)
{
    return static_cast<std::size_t>(std::count_if(
        windows.begin(), windows.end(), [](const Element &each) { return each.role == Element::Dialog; }));
}

// Presses without looking in between, and gives the windows that are open once all presses have taken effect.
std::vector<Element> pressOften(const AccessibleTree &tree, const Element &button)
{
    for (int i = 0; i < 3; ++i)
        tree.press(button, soon());
    return *waitFor(soon(), QStringLiteral("the windows cannot be read"),
                    [&tree] { return std::make_optional(tree.windows()); });
}

// On the keyboard, in the window that has the focus.
void keyboard(const QStringList &words)
{
    if (QProcess::execute(QStringLiteral("xdotool"), words) != 0)
        throw Error(QStringLiteral("xdotool cannot %1").arg(words.join(QLatin1Char(' '))));
}

void awaitFocus()
{
    waitFor(soon(), QStringLiteral("no window has the focus"), [] {
        return QProcess::execute(QStringLiteral("xdotool"), {QStringLiteral("getactivewindow")}) == 0;
    });
}

void holdReturn()
{
    keyboard({QStringLiteral("keydown"), QStringLiteral("Return")});
    QThread::msleep(kHoldMs);
    keyboard({QStringLiteral("keyup"), QStringLiteral("Return")});
}

} // namespace

// The real program in a world, worked through the accessibility bus by somebody who presses what cannot be
// reached, and by keys that are held. Meanwhile all that is told on that bus is written down.
class TestAssistiveTechnology : public QObject
{
    Q_OBJECT

public Q_SLOTS:
    void hear(const QDBusMessage &event);

private Q_SLOTS:
    void initTestCase();
    void cleanupTestCase();
    void holdsReturnOnThePanel();
    void opensOneAdministratorDialog();
    void asksTheServerOnce();
    void holdsReturnOnTheAccountPage();
    void tellsNoPassword();

private:
    void play(const Script &script);
    QByteArray journal() const { return m_run.content("journal.log").mid(m_journalStart); }

    WorldRun m_run;
    std::unique_ptr<World> m_world;
    QProcess m_windowManager;
    QString m_heard;
    int m_journalStart = 0; // of the latest play()
};

// A terminal that has joined.
void TestAssistiveTechnology::initTestCase()
{
    QVERIFY2(m_run.play("join", "join-ok") == 0, m_run.output().constData());
    WorldOptions options;
    options.state = m_run.path("");
    options.scenarioFile = Scenario::standardDirectory() + QStringLiteral("/leave-ok.json");
    options.virtualDisplay = true;
    options.accessible = true;
    m_world = std::make_unique<World>(options);
    m_world->start();
    const QProcessEnvironment environment = m_world->readerEnvironment();
    for (const QString &name : environment.keys())
        qputenv(name.toLatin1().constData(), environment.value(name).toLocal8Bit());
    m_windowManager.start(QStringLiteral("openbox"), QStringList());
    QVERIFY(m_windowManager.waitForStarted());
    auto bus = QDBusConnection::connectToBus(m_world->readerBusAddress(), QStringLiteral("listener"));
    QVERIFY(bus.connect({}, {}, QStringLiteral("org.a11y.atspi.Event.Object"), {}, this,
                        SLOT(hear(QDBusMessage))));
    QDBusMessage announce = QDBusMessage::createMethodCall(
        QStringLiteral("org.a11y.atspi.Registry"), QStringLiteral("/org/a11y/atspi/registry"),
        QStringLiteral("org.a11y.atspi.Registry"), QStringLiteral("RegisterEvent"));
    announce << QStringLiteral("object:") << QStringList() << QString();
    QCOMPARE(bus.call(announce).errorMessage(), QString());
}

void TestAssistiveTechnology::hear(const QDBusMessage &event)
{
    m_heard += event.arguments().value(3).value<QDBusVariant>().variant().toString();
}

void TestAssistiveTechnology::cleanupTestCase()
{
    QDBusConnection::disconnectFromBus(QStringLiteral("listener"));
    m_windowManager.kill();
    m_windowManager.waitForFinished();
    m_world.reset();
}

// Starts the program and runs the script while this thread serves the world; the program must live on.
void TestAssistiveTechnology::play(const Script &script)
{
    m_journalStart = m_run.content("journal.log").size();
    m_world->startProgram({findTool(QStringLiteral("veskw"))});
    std::future<QString> outcome = std::async(std::launch::async, [&]() -> QString {
        try {
            script(AccessibleTree(World::programName(), soon()));
            return {};
        } catch (const Error &failure) {
            return failure.text();
        }
    });
    QTRY_VERIFY_WITH_TIMEOUT(outcome.wait_for(std::chrono::seconds(0)) == std::future_status::ready,
                             3 * kLimitMs);
    const QString error = outcome.get();
    QVERIFY2(error.isEmpty(), qPrintable(error));
    QCOMPARE(m_world->program().state(), QProcess::Running);
    m_world->reboot();
}

void TestAssistiveTechnology::holdsReturnOnThePanel()
{
    play([](const AccessibleTree &tree) {
        button(tree, QStringLiteral("解除"));
        awaitFocus();
        holdReturn();
        button(tree, QStringLiteral("授权"));
    });
    QCOMPARE(journal().count("keyword=remove"), 1);
    QCOMPARE(journal().count("remove_status"), 0);
}

void TestAssistiveTechnology::opensOneAdministratorDialog()
{
    std::size_t open = 0;
    play([&open](const AccessibleTree &tree) {
        const Element leave = button(tree, QStringLiteral("解除"));
        pressOften(tree, leave);
        const Element authorise = button(tree, QStringLiteral("授权"));
        open = dialogs(pressOften(tree, leave));
        type(tree, QStringLiteral("管理员帐号"), QStringLiteral("admin"));
        type(tree, QStringLiteral("密码"), kAdminPassword);
        pressOften(tree, authorise);
        button(tree, QStringLiteral("立即重启"));
    });
    QCOMPARE(open, std::size_t(1));
    QCOMPARE(journal().count("keyword=remove"), 1);
    QCOMPARE(journal().count("request POST /uim/v3/client/remove_status"), 1);
    QCOMPARE(journal().count("request POST /uim/v3/client/remove from"), 1);
}

void TestAssistiveTechnology::asksTheServerOnce()
{
    std::size_t open = 0;
    const QString port = QString::number(m_world->enrolmentPort());
    play([&open, &port](const AccessibleTree &tree) {
        type(tree, QStringLiteral("域地址"), QStringLiteral("localhost"));
        type(tree, QStringLiteral("端口"), port);
        const Element serverNext = button(tree, kNext);
        pressOften(tree, serverNext);
        type(tree, QStringLiteral("域帐号"), QStringLiteral("liming"));
        type(tree, QStringLiteral("密码"), QStringLiteral("wrong"));
        const Element accountNext = button(tree, kNext);
        pressOften(tree, accountNext);
        const Element dismiss = button(tree, QStringLiteral("确定"));
        pressOften(tree, accountNext);                // behind the message box
        open = dialogs(pressOften(tree, serverNext)); // of a page that is hidden now
        tree.press(dismiss, soon());
        button(tree, kNext);
    });
    QCOMPARE(open, std::size_t(1));
    QCOMPARE(journal().count("request GET /apiauth/v1/client/ca_cert"), 1);
    QCOMPARE(journal().count("request POST /uim/v3/client/auth"), 1);
}

void TestAssistiveTechnology::holdsReturnOnTheAccountPage()
{
    std::size_t open = 0;
    const QString port = QString::number(m_world->enrolmentPort());
    play([&open, &port](const AccessibleTree &tree) {
        type(tree, QStringLiteral("域地址"), QStringLiteral("localhost"));
        type(tree, QStringLiteral("端口"), port);
        tree.press(button(tree, kNext), soon());
        const Element reveal = button(tree, QStringLiteral("显示密码"));
        awaitFocus();
        keyboard({QStringLiteral("type"), QStringLiteral("liming\t") + kWrongPassword});
        keyboard({QStringLiteral("key"), QStringLiteral("BackSpace")});
        tree.press(reveal, soon());
        keyboard({QStringLiteral("type"), kWrongPassword.right(1)});
        button(tree, kNext);
        holdReturn();
        open = dialogs(tree.windows());
    });
    QCOMPARE(open, std::size_t(1));
    QCOMPARE(journal().count("request POST /uim/v3/client/auth"), 1);
}

// After a leave and two attempts to join, with passwords typed, set, deleted and revealed.
void TestAssistiveTechnology::tellsNoPassword()
{
    QVERIFY2(m_heard.contains(QStringLiteral("liming")), qPrintable(m_heard));
    QVERIFY(m_heard.contains(QString(kWrongPassword.size() - 1, QChar(0x2022))));
    for (const QString &password : {kAdminPassword, kWrongPassword, QStringLiteral("wrong")})
        QVERIFY2(!m_heard.contains(password.left(3)), qPrintable(m_heard));
}

QTEST_GUILESS_MAIN(TestAssistiveTechnology)
#include "tst_assistivetechnology.moc"
