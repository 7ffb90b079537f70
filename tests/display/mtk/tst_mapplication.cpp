// SPDX-License-Identifier: Apache-2.0
#include "isolatedfiles.h"
#include "themedtest.h"

#include <QProcess>
#include <QPushButton>
#include <QSignalSpy>
#include <QTemporaryDir>

#include <csignal>
#include <memory>
#include <vector>

#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

using Mtk::Widget::MApplication;

namespace {

constexpr int kPatience = 20000; // milliseconds, for a process under sanitizers

class Probe
{
public:
    explicit Probe(const QStringList &arguments, const QProcessEnvironment &environment = ownEnvironment())
    {
        m_process.setProcessEnvironment(environment);
        m_process.start(QStringLiteral(START_PROBE), arguments);
    }
    ~Probe()
    {
        m_process.closeWriteChannel();
        if (!m_process.waitForFinished(kPatience))
            m_process.kill();
        m_process.waitForFinished();
    }
    Q_DISABLE_COPY(Probe)

    static QProcessEnvironment ownEnvironment() { return QProcessEnvironment::systemEnvironment(); }

    QByteArray line()
    {
        while (!m_process.canReadLine() && m_process.waitForReadyRead(kPatience)) {
        }
        return m_process.readLine().trimmed();
    }
    QProcess &process() { return m_process; }

private:
    QProcess m_process;
};

std::unique_ptr<Probe> claim(const QString &key,
                             const QProcessEnvironment &environment = Probe::ownEnvironment())
{
    return std::make_unique<Probe>(QStringList{QStringLiteral("claim"), key}, environment);
}

QString sessionFolder()
{
    return QStringLiteral("/run/user/%1").arg(geteuid());
}

QString fallbackFolder()
{
    const passwd *user = getpwuid(geteuid());
    return QStringLiteral("/tmp/runtime-") + QString::fromLocal8Bit(user != nullptr ? user->pw_name : "");
}

// kind: octal mode, or "missing", "file", "foreign", "link".
bool makeFolder(const QString &kind, const QString &path)
{
    constexpr uid_t kSomebodyElse = 1001;
    isolatedfiles::remove(path);
    const QByteArray name = QFile::encodeName(path);
    if (kind == QLatin1String("missing"))
        return true;
    if (kind == QLatin1String("file"))
        return isolatedfiles::write(path, "");
    if (kind == QLatin1String("link"))
        return QDir().mkpath(QStringLiteral("/tmp/target")) &&
               QFile::link(QStringLiteral("/tmp/target"), path);
    if (!QDir().mkdir(path))
        return false;
    if (kind == QLatin1String("foreign"))
        return chown(name.constData(), kSomebodyElse, kSomebodyElse) == 0;
    return chmod(name.constData(), kind.toUInt(nullptr, 8)) == 0;
}

} // namespace

class TestMApplication : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void oneOfManyStartsWins();
    void claimEndsWithItsHolder_data();
    void claimEndsWithItsHolder();
    void childrenDontHoldTheClaim();
    void keysAreApart();
    void claimIsKept();
    void claimLiesInTheFirstFitFolder_data();
    void claimLiesInTheFirstFitFolder();
    void unusableFolderLetsTheProgramStart();
    void noDisplayIsToldInOneLine_data();
    void noDisplayIsToldInOneLine();
    void busyNests();
    void themeIsInstalled();
};

void TestMApplication::oneOfManyStartsWins()
{
    std::vector<std::unique_ptr<Probe>> probes;
    probes.reserve(16);
    for (int i = 0; i < 16; ++i)
        probes.push_back(claim(QStringLiteral("race")));
    QByteArrayList answers;
    for (const auto &probe : probes)
        answers << probe->line();
    QCOMPARE(answers.count("won"), 1);
    QCOMPARE(answers.count("lost"), 15);
}

void TestMApplication::claimEndsWithItsHolder_data()
{
    QTest::addColumn<bool>("killed");
    QTest::newRow("ends") << false;
    QTest::newRow("is killed") << true;
}

void TestMApplication::claimEndsWithItsHolder()
{
    QFETCH(bool, killed);
    const QString key = QStringLiteral("held");
    const auto holder = claim(key);
    QCOMPARE(holder->line(), QByteArray("won"));
    QCOMPARE(claim(key)->line(), QByteArray("lost"));
    if (killed)
        holder->process().kill();
    else
        holder->process().closeWriteChannel();
    QVERIFY(holder->process().waitForFinished(kPatience));
    QCOMPARE(claim(key)->line(), QByteArray("won"));
}

void TestMApplication::childrenDontHoldTheClaim()
{
    const QString key = QStringLiteral("left behind");
    Probe holder({QStringLiteral("leave-child"), key});
    const pid_t child = holder.line().toInt();
    QVERIFY(child > 0);
    QVERIFY(holder.process().state() == QProcess::NotRunning || holder.process().waitForFinished(kPatience));
    QCOMPARE(holder.process().exitCode(), 0);
    const QByteArray answer = claim(key)->line();
    QCOMPARE(kill(child, SIGTERM), 0); // it was still there
    QCOMPARE(answer, QByteArray("won"));
}

void TestMApplication::keysAreApart()
{
    const auto first = claim(QStringLiteral("one"));
    QCOMPARE(first->line(), QByteArray("won"));
    QCOMPARE(claim(QStringLiteral("../two/ä"))->line(), QByteArray("won"));
    QCOMPARE(claim(QStringLiteral("one"))->line(), QByteArray("lost"));
}

void TestMApplication::claimIsKept()
{
    auto *application = qobject_cast<MApplication *>(qApp);
    QVERIFY(application->setSingleInstance(QStringLiteral("own")));
    QVERIFY(application->setSingleInstance(QStringLiteral("own")));
    QCOMPARE(claim(QStringLiteral("own"))->line(), QByteArray("lost"));
}

void TestMApplication::claimLiesInTheFirstFitFolder_data()
{
    QTest::addColumn<QString>("session");  // what XDG_RUNTIME_DIR names
    QTest::addColumn<QString>("fallback"); // what /tmp/runtime-NAME is
    QTest::addColumn<QString>("place");
    QTest::newRow("the session's") << "0700"
                                   << "missing"
                                   << "session";
    QTest::newRow("the session's, which others can read") << "0755"
                                                          << "missing"
                                                          << "session";
    QTest::newRow("the session's, which others can write") << "0777"
                                                           << "missing"
                                                           << "fallback";
    QTest::newRow("no session") << "file"
                                << "0700"
                                << "fallback";
    QTest::newRow("another user's in /tmp") << "file"
                                            << "foreign"
                                            << "home";
    QTest::newRow("a link in /tmp") << "file"
                                    << "link"
                                    << "home";
    QTest::newRow("in /tmp, which the group can write") << "file"
                                                        << "0770"
                                                        << "home";
}

void TestMApplication::claimLiesInTheFirstFitFolder()
{
    QFETCH(QString, session);
    QFETCH(QString, fallback);
    QFETCH(QString, place);
    if (place != QLatin1String("session") && QFileInfo(sessionFolder()).ownerId() == geteuid())
        QSKIP("a session's folder of this machine comes first");
    const QTemporaryDir folder;
    const QString home = folder.filePath(QStringLiteral("home"));
    const QMap<QString, QString> places{
        {QStringLiteral("session"), folder.filePath(QStringLiteral("session"))},
        {QStringLiteral("fallback"), fallbackFolder()},
        {QStringLiteral("home"), home + QStringLiteral("/.cache")}};
    QVERIFY(QDir().mkdir(home));
    QVERIFY(makeFolder(session, places.value(QStringLiteral("session"))));
    if (!makeFolder(fallback, fallbackFolder()))
        QSKIP("only root can make another user's folder");

    QProcessEnvironment environment = Probe::ownEnvironment();
    environment.insert(QStringLiteral("HOME"), home);
    environment.insert(QStringLiteral("XDG_RUNTIME_DIR"), places.value(QStringLiteral("session")));
    const QString key = QStringLiteral("place");
    const auto holder = claim(key, environment);
    QCOMPARE(holder->line(), QByteArray("won"));
    QStringList found;
    for (auto candidate = places.begin(); candidate != places.end(); ++candidate)
        if (QFile::exists(candidate.value() + QLatin1Char('/') + key + QStringLiteral(".instance")))
            found.append(candidate.key());
    QCOMPARE(found, QStringList(place));

    // A start that knows less finds the same.
    if (place != QLatin1String("session"))
        environment.remove(QStringLiteral("XDG_RUNTIME_DIR"));
    QCOMPARE(claim(key, environment)->line(), QByteArray("lost"));
}

void TestMApplication::unusableFolderLetsTheProgramStart()
{
    if (QFileInfo(sessionFolder()).ownerId() == geteuid())
        QSKIP("this machine has a session's folder");
    const QTemporaryDir folder;
    QProcessEnvironment environment = Probe::ownEnvironment();
    // A file where the folder should be stops root as well.
    QVERIFY(isolatedfiles::write(fallbackFolder(), ""));
    for (const char *name : {"XDG_RUNTIME_DIR", "HOME"})
        environment.insert(QLatin1String(name), fallbackFolder());
    const auto probe = claim(QStringLiteral("any"), environment);
    QCOMPARE(probe->line(), QByteArray("won"));
    QVERIFY(probe->process().readAllStandardError().contains("A second start cannot be told from the first"));
}

void TestMApplication::noDisplayIsToldInOneLine_data()
{
    QTest::addColumn<QString>("display");
    QTest::addColumn<QString>("platform");
    QTest::addColumn<QByteArray>("reason");
    QTest::newRow("none set") << QString() << QString()
                              << QByteArray("neither DISPLAY nor WAYLAND_DISPLAY is set");
    QTest::newRow("not reached") << QStringLiteral(":4711") << QString() << QByteArray(":4711");
    QTest::newRow("unknown platform") << QString() << QStringLiteral("nonsense") << QByteArray("nonsense");
}

void TestMApplication::noDisplayIsToldInOneLine()
{
    QFETCH(QString, display);
    QFETCH(QString, platform);
    QFETCH(QByteArray, reason);
    QProcessEnvironment environment = Probe::ownEnvironment();
    for (const char *name : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"})
        environment.remove(QLatin1String(name));
    if (!display.isEmpty())
        environment.insert(QStringLiteral("DISPLAY"), display);
    if (!platform.isEmpty())
        environment.insert(QStringLiteral("QT_QPA_PLATFORM"), platform);
    const auto probe = claim(QStringLiteral("display"), environment);
    QVERIFY(probe->process().waitForFinished(kPatience));
    QCOMPARE(probe->process().exitStatus(), QProcess::NormalExit);
    QCOMPARE(probe->process().exitCode(), 1);
    const QByteArray told = probe->process().readAllStandardError();
    QVERIFY2(told.contains(reason), told.constData());
    QCOMPARE(told.count('\n'), 1);
}

void TestMApplication::busyNests()
{
    // By name, as the transport does, which doesn't know the class.
    const auto set = [](bool busy) {
        QVERIFY(qApp->setProperty("busy", busy));
    };
    const auto isShown = [] {
        const bool isBusy = qApp->property("busy").toBool();
        const QCursor *cursor = QApplication::overrideCursor();
        return isBusy && cursor != nullptr && cursor->shape() == Qt::BusyCursor;
    };
    set(false);
    set(true);
    set(true);
    QVERIFY(isShown());
    set(false);
    QVERIFY(isShown());
    set(false);
    QVERIFY(!isShown());
    QVERIFY(QApplication::overrideCursor() == nullptr);
}

void TestMApplication::themeIsInstalled()
{
    QCOMPARE(QApplication::palette().color(QPalette::Window), QColor(247, 247, 247));
    QCOMPARE(QApplication::font().pixelSize(), 14);
    QVERIFY(QFontMetrics(QApplication::font()).inFont(QChar(0x57df)));
}

THEMED_TEST_MAIN(TestMApplication)
#include "tst_mapplication.moc"
