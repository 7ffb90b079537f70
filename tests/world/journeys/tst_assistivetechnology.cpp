// SPDX-License-Identifier: Apache-2.0
#include "accessibletree.h"
#include "pages.h"
#include "waitfor.h"
#include "world/child.h"
#include "world/world.h"
#include "worldrun.h"

#include <QDBusArgument>
#include <QDBusVariant>
#include <QRegularExpression>
#include <QTest>
#include <QThread>

#include <algorithm>
#include <functional>
#include <future>

using namespace sandbox;

namespace {

constexpr int kLimitMs = 60000;

constexpr unsigned kHoldMs = 1500;     // the server waits 660 ms before it repeats a key
constexpr unsigned kLongHoldMs = 4000; // longer than the toolkit remembers a key of which nothing is heard

const QString kNext = QStringLiteral("下一步");
const QString kRefused = QStringLiteral("帐号或密码错误");
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

// What is in front, by the words that are read there, what is done there on the keyboard, and the key that is
// held then. Two presses of it would be seen: another request, or another place.
struct Place
{
    QString title;
    QString words; // for xdotool
    QString key;
    unsigned holdMs = kHoldMs;
};

// Waits until the place has the focus and nothing but the user is waited for.
void awaitPlace(const AccessibleTree &tree, const AccessibleBus &bus, const QString &title)
{
    constexpr uint kActive = 1U << 1U; // of the AT-SPI 2 protocol
    waitFor(soon(), title + QStringLiteral(" is not in front"), [&] {
        const std::optional<Window> front = Window::inFront(tree.windows());
        if (!front || !front->isAtRest() ||
            title != (front->page != nullptr ? front->page->title : front->element.name))
            return false;
        const QVariant states = bus.call(front->element.object, QStringLiteral("org.a11y.atspi.Accessible"),
                                         QStringLiteral("GetState"));
        return (qdbus_cast<QList<uint>>(states).value(0) & kActive) != 0;
    });
}

void hold(const Place &place)
{
    if (!place.words.isEmpty())
        keyboard(place.words.split(QLatin1Char(' ')));
    keyboard({QStringLiteral("keydown"), place.key});
    QThread::msleep(place.holdMs);
    keyboard({QStringLiteral("keyup"), place.key});
}

const QString kReturn = QStringLiteral("Return");
const QString kSpace = QStringLiteral("space");

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
    void leavesByHeldKeys();
    void asksTheServerOnce();
    void joinsByHeldKeys();
    void opensOneAdministratorDialog();
    void refusesCallsWithoutArguments();
    void tellsNoPassword();

private:
    void play(const Script &script, const QString &program = QStringLiteral("veskw"),
              const QString &name = World::programName());
    void play(const std::vector<Place> &places);
    QString events() const;

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
void TestAssistiveTechnology::play(const Script &script, const QString &program, const QString &name)
{
    m_journalStart = m_run.content("journal.log").size();
    m_world->startProgram({findTool(program)});
    std::future<QString> outcome = std::async(std::launch::async, [&]() -> QString {
        try {
            script(AccessibleTree(name, soon()));
            return {};
        } catch (const Error &failure) {
            return failure.text();
        }
    });
    QTRY_VERIFY_WITH_TIMEOUT(outcome.wait_for(std::chrono::seconds(0)) == std::future_status::ready,
                             3 * kLimitMs);
    const QString error = outcome.get();
    const bool isRunning = m_world->program().state() == QProcess::Running;
    m_world->reboot();
    QVERIFY2(error.isEmpty(), qPrintable(error));
    QVERIFY(isRunning);
}

void TestAssistiveTechnology::play(const std::vector<Place> &places)
{
    play([&](const AccessibleTree &tree) {
        const AccessibleBus bus(m_world->readerBusAddress());
        for (const Place &each : places) {
            awaitPlace(tree, bus, each.title);
            hold(each);
        }
    });
}

// Requests to the server and for a reboot, since the latest play().
QString TestAssistiveTechnology::events() const
{
    static const QRegularExpression event(QStringLiteral(R"(request \w+ [^ ?]*/(\w+)|(Reboot)\(true\))"));
    QStringList found;
    const QByteArray journal = m_run.content("journal.log").mid(m_journalStart);
    for (auto each = event.globalMatch(QString::fromUtf8(journal)); each.hasNext();) {
        const QRegularExpressionMatch match = each.next();
        found.append(match.captured(match.lastCapturedIndex()));
    }
    return found.join(QLatin1Char(' '));
}

void TestAssistiveTechnology::leavesByHeldKeys()
{
    const QString panel = QStringLiteral("该终端已经加入管控,是否解除管控?");
    const QString dialog = QStringLiteral("退出域管系统需要管理员权限");
    const QString account = QStringLiteral("type admin\t%1");
    play({{panel, {}, kReturn, kLongHoldMs},
          {dialog, account.arg(kWrongPassword), kReturn},
          {kRefused, {}, kReturn},
          {panel, {}, kSpace},
          {dialog, account.arg(kAdminPassword), kReturn},
          {QStringLiteral("当前终端已解除管控，重启后生效"), QStringLiteral("key Tab"), kReturn}});
    QCOMPARE(events(), QStringLiteral("status remove_status status remove_status remove Reboot"));
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
    QCOMPARE(events(), QStringLiteral("ca_cert status auth"));
}

// The way back as well: each page that shows again is filled in, and one more press would leave it.
void TestAssistiveTechnology::joinsByHeldKeys()
{
    const QString server = QStringLiteral("服务器配置");
    const QString account = QStringLiteral("请校验域帐号密码");
    const QString alias = QStringLiteral("新建终端别名");
    const QString summary = QStringLiteral("完成配置");
    const QString toPrevious = QStringLiteral("key shift+Tab shift+Tab");
    play({{server, QStringLiteral("key ctrl+a type localhost\t%1").arg(m_world->enrolmentPort()), kReturn},
          {account,
           QStringLiteral("type --args 1 liming\t%1 key BackSpace Tab space shift+Tab End type %2")
               .arg(kWrongPassword, kWrongPassword.right(1)),
           kReturn, kLongHoldMs},
          {kRefused, {}, kReturn},
          {account, QStringLiteral("key ctrl+a type Terminal-7"), kReturn},
          {alias, QStringLiteral("key ctrl+a type terminal-01"), kReturn},
          {summary, QStringLiteral("key Tab"), kReturn},
          {alias, toPrevious, kReturn},
          {account, toPrevious, kSpace},
          {server, {}, kReturn},
          {account, {}, kReturn},
          {alias, {}, QStringLiteral("KP_Enter")},
          {summary, QStringLiteral("key Tab Tab"), kSpace},
          {QStringLiteral("终端已成功加入域管,重启电脑生效"), QStringLiteral("key Tab"), kReturn}});
    QCOMPARE(events(),
             QStringLiteral("ca_cert status auth auth config ca_cert status auth config join Reboot"));
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
    QCOMPARE(events(), QStringLiteral("status remove_status remove"));
}

// The program itself shows a widget with a value for a moment only.
void TestAssistiveTechnology::refusesCallsWithoutArguments()
{
    const auto refusesAll = [this](Element::Role role, const QStringList &calls) {
        return [this, role, calls](const AccessibleTree &tree) {
            const auto object = waitFor(soon(), QStringLiteral("the widget does not show"), [&] {
                for (const Element &window : tree.windows()) {
                    if (const auto all = window.all(role); !all.empty())
                        return std::make_optional(all.front()->object);
                }
                return std::optional<ObjectRef>();
            });
            const AccessibleBus bus(m_world->readerBusAddress());
            for (const QString &call : calls) {
                const QDBusMessage answer = bus.send(*object, call.section(QLatin1Char('.'), 0, -2),
                                                     call.section(QLatin1Char('.'), -1), {}, kLimitMs);
                if (answer.errorName() != QDBusError::errorString(QDBusError::InvalidArgs))
                    throw Error(call + QLatin1Char(' ') + answer.errorMessage());
            }
        };
    };
    const QString gallery = QStringLiteral("mtk-gallery");
    play(refusesAll(Element::Progress, {QStringLiteral("org.a11y.atspi.Value.SetCurrentValue")}), gallery,
         gallery);
    play(refusesAll(Element::Text, {QStringLiteral("org.a11y.atspi.Accessible.GetChildAtIndex"),
                                    QStringLiteral("org.a11y.atspi.Component.GetExtents"),
                                    QStringLiteral("org.a11y.atspi.Action.DoAction"),
                                    QStringLiteral("org.a11y.atspi.Text.GetText"),
                                    QStringLiteral("org.a11y.atspi.EditableText.SetTextContents"),
                                    QStringLiteral("org.freedesktop.DBus.Properties.Get"),
                                    QStringLiteral("org.freedesktop.DBus.Properties.Set")}));
}

// After a leave and two attempts to join, with passwords typed, set, deleted and revealed.
void TestAssistiveTechnology::tellsNoPassword()
{
    for (const QString &password : {kAdminPassword, kWrongPassword, QStringLiteral("wrong")})
        QVERIFY2(!m_heard.contains(password.left(3)), qPrintable(m_heard));
    QVERIFY2(m_heard.contains(QStringLiteral("liming")), qPrintable(m_heard));
    QVERIFY(m_heard.contains(QString(kWrongPassword.size() - 1, QChar(0x2022))));
}

QTEST_GUILESS_MAIN(TestAssistiveTechnology)
#include "tst_assistivetechnology.moc"
