// SPDX-License-Identifier: Apache-2.0
#include "isolatedfiles.h"
#include "themedtest.h"

#include <QProcess>
#include <QTemporaryDir>

#include <csignal>
#include <memory>
#include <vector>

#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

using Mtk::Widget::MApplication;

namespace {

constexpr int kTimeoutMs = 20000; // for a process under sanitizers

// A program of the desktop that starts; startprobe.cpp says what it can do.
class Probe : public QProcess
{
public:
    explicit Probe(const QString &key,
                   const QProcessEnvironment &environment = QProcessEnvironment::systemEnvironment(),
                   const QString &deed = QStringLiteral("claim"))
    {
        setProcessEnvironment(environment);
        start(QStringLiteral(START_PROBE), {deed, key});
    }
    ~Probe() override
    {
        closeWriteChannel();
        if (!waitForFinished(kTimeoutMs))
            kill();
        waitForFinished();
    }

    QByteArray answer()
    {
        while (!canReadLine() && waitForReadyRead(kTimeoutMs)) {
        }
        return readLine().trimmed();
    }
};

QString fallbackDirectory()
{
    const passwd *user = getpwuid(geteuid());
    return QStringLiteral("/tmp/runtime-") + QString::fromLocal8Bit(user != nullptr ? user->pw_name : "");
}

// kind: octal mode, or "missing", "file", "foreign", "link".
bool makeDirectory(const QString &kind, const QString &path)
{
    isolatedfiles::remove(path);
    const QByteArray name = QFile::encodeName(path);
    if (kind == QLatin1String("missing"))
        return true;
    if (kind == QLatin1String("file"))
        return isolatedfiles::write(path, "");
    if (kind == QLatin1String("link"))
        return QFile::link(QDir::homePath(), path);
    if (!QDir().mkdir(path))
        return false;
    return chmod(name.constData(), kind == QLatin1String("foreign") ? 0700 : kind.toUInt(nullptr, 8)) == 0;
}

} // namespace

class TestMApplication : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void oneOfManyStartsWins()
    {
        std::vector<std::unique_ptr<Probe>> probes(16);
        for (auto &probe : probes)
            probe = std::make_unique<Probe>(QStringLiteral("race"));
        QByteArrayList answers;
        for (const auto &probe : probes)
            answers << probe->answer();
        QCOMPARE(answers.count("won"), 1);
        QCOMPARE(answers.count("lost"), 15);
    }

    void claimEndsWithItsHolder()
    {
        const QString key = QStringLiteral("held");
        for (const bool killed : {false, true}) {
            Probe holder(key);
            QCOMPARE(holder.answer(), QByteArray("won"));
            QCOMPARE(Probe(key).answer(), QByteArray("lost"));
            if (killed)
                holder.kill();
            else
                holder.closeWriteChannel();
            QVERIFY(holder.waitForFinished(kTimeoutMs));
        }
        QCOMPARE(Probe(key).answer(), QByteArray("won"));
    }

    void childrenDontHoldTheClaim()
    {
        const QString key = QStringLiteral("left behind");
        Probe holder(key, QProcessEnvironment::systemEnvironment(), QStringLiteral("leave-child"));
        const pid_t child = holder.answer().toInt();
        QVERIFY(child > 0);
        QVERIFY(holder.state() == QProcess::NotRunning || holder.waitForFinished(kTimeoutMs));
        QCOMPARE(holder.exitCode(), 0);
        const QByteArray answer = Probe(key).answer();
        QCOMPARE(kill(child, SIGTERM), 0); // it was still there
        QCOMPARE(answer, QByteArray("won"));
    }

    void claimIsKeptForEachKey()
    {
        auto *application = qobject_cast<MApplication *>(qApp);
        QVERIFY(application->setSingleInstance(QStringLiteral("own")));
        QVERIFY(application->setSingleInstance(QStringLiteral("own")));
        QCOMPARE(Probe(QStringLiteral("../two/ä")).answer(), QByteArray("won"));
        QCOMPARE(Probe(QStringLiteral("own")).answer(), QByteArray("lost"));
    }

    void claimLiesInTheFirstFitDirectory_data()
    {
        QTest::addColumn<QString>("session");  // what XDG_RUNTIME_DIR names
        QTest::addColumn<QString>("fallback"); // what /tmp/runtime-NAME is
        QTest::addColumn<QString>("place");
        const auto row = [](const char *name, const char *session, const char *fallback, const char *place) {
            QTest::newRow(name) << QString::fromLatin1(session) << QString::fromLatin1(fallback)
                                << QString::fromLatin1(place);
        };
        row("the session's", "0700", "missing", "session");
        row("the session's, which others can read", "0755", "missing", "session");
        row("the session's, which others can write", "0777", "missing", "fallback");
        row("no session", "file", "0700", "fallback");
        row("another user's in /tmp", "file", "foreign", "home");
        row("a link in /tmp", "file", "link", "home");
        row("in /tmp, which the group can write", "file", "0770", "home");
        row("none, and the program starts all the same", "file", "file", "");
    }

    void claimLiesInTheFirstFitDirectory()
    {
        QFETCH(QString, session);
        QFETCH(QString, fallback);
        QFETCH(QString, place);
        const QTemporaryDir home;
        const QString runtime = home.filePath(QStringLiteral("session"));
        const QMap<QString, QString> places{
            {QStringLiteral("session"), runtime},
            {QStringLiteral("fallback"), fallbackDirectory()},
            {QStringLiteral("home"), home.filePath(QStringLiteral(".cache"))}};
        QVERIFY(makeDirectory(session, runtime));
        if (place.isEmpty())
            QVERIFY(makeDirectory(session, places.value(QStringLiteral("home"))));
        QVERIFY(makeDirectory(fallback, fallbackDirectory()));

        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("HOME"), home.path());
        environment.insert(QStringLiteral("XDG_RUNTIME_DIR"), runtime);
        if (fallback == QLatin1String("foreign"))
            environment.insert(QStringLiteral("FOREIGN_DIRECTORY"), fallbackDirectory());
        const QString key = QStringLiteral("place");
        Probe holder(key, environment);
        QCOMPARE(holder.answer(), QByteArray("won"));
        QStringList found;
        for (const QString &candidate : places.keys())
            if (QFile::exists(places.value(candidate) + QStringLiteral("/place.instance")))
                found.append(candidate);
        QCOMPARE(found.join(QLatin1Char(' ')), place);
        QCOMPARE(holder.readAllStandardError().contains("A second start cannot be told from the first"),
                 place.isEmpty());

        // A start that knows less finds the same.
        if (place != QLatin1String("session"))
            environment.remove(QStringLiteral("XDG_RUNTIME_DIR"));
        QCOMPARE(Probe(key, environment).answer(), QByteArray(place.isEmpty() ? "won" : "lost"));
    }

    // The line names the unusable part of the environment.
    void noDisplayIsToldInOneLine()
    {
        const QMap<QString, QString> settings{
            {QStringLiteral("NONE"), QStringLiteral("neither DISPLAY nor WAYLAND_DISPLAY is set")},
            {QStringLiteral("DISPLAY"), QStringLiteral(":4711")},
            {QStringLiteral("QT_QPA_PLATFORM"), QStringLiteral("nonsense")}};
        for (const QString &variable : settings.keys()) {
            QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
            for (const char *name : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"})
                environment.remove(QLatin1String(name));
            environment.insert(variable, settings.value(variable));
            Probe probe(QStringLiteral("display"), environment);
            QVERIFY(probe.waitForFinished(kTimeoutMs));
            QCOMPARE(probe.exitStatus(), QProcess::NormalExit);
            QCOMPARE(probe.exitCode(), 1);
            const QByteArray told = probe.readAllStandardError();
            QVERIFY2(told.contains(settings.value(variable).toLatin1()), told.constData());
            QCOMPARE(told.count('\n'), 1);
        }
    }

    void busyNests()
    {
        QVector<bool> shown;
        for (const bool busy : {false, true, true, false, false}) {
            // By name, as the transport does, which doesn't know the class.
            QVERIFY(qApp->setProperty("busy", busy));
            const QCursor *cursor = QApplication::overrideCursor();
            shown << (cursor != nullptr && cursor->shape() == Qt::BusyCursor);
            QCOMPARE(qApp->property("busy").toBool(), shown.last());
        }
        QCOMPARE(shown, QVector<bool>({false, true, true, true, false}));
        QVERIFY(QApplication::overrideCursor() == nullptr);
    }

    void themeStays_data()
    {
        QTest::addColumn<QString>("setting");
        QTest::newRow("another style") << QStringLiteral("QT_STYLE_OVERRIDE=windows");
        QTest::newRow("the user's font and palette") << QStringLiteral("QT_QPA_PLATFORMTHEME=qt5ct");
    }

    void themeStays()
    {
        QFETCH(QString, setting);
        const QTemporaryDir settings;
        QVERIFY(QDir(settings.path()).mkdir(QStringLiteral("qt5ct")));
        QVERIFY(isolatedfiles::write(settings.filePath(QStringLiteral("qt5ct/qt5ct.conf")),
                                     "[Appearance]\ncustom_palette=true\n"
                                     "color_scheme_path=/usr/share/qt5ct/colors/darker.conf\n"));
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        const QByteArray look = Probe(QString(), environment, QStringLiteral("look")).answer();
        QVERIFY2(look.startsWith("Mtk::ThemeStyle"), look.constData());
        environment.insert(QStringLiteral("XDG_CONFIG_HOME"), settings.path());
        environment.insert(setting.section(QLatin1Char('='), 0, 0), setting.section(QLatin1Char('='), 1));
        QCOMPARE(Probe(QString(), environment, QStringLiteral("look")).answer(), look);
    }

    void themeIsInstalled()
    {
        QCOMPARE(QGuiApplication::desktopFileName(), QStringLiteral("tst_mapplication"));
        QCOMPARE(QApplication::palette().color(QPalette::Window), QColor(247, 247, 247));
        QCOMPARE(QApplication::font().pixelSize(), 14);
        QVERIFY(QFontMetrics(QApplication::font()).inFont(QChar(0x57df)));
    }
};

THEMED_TEST_MAIN(TestMApplication)
#include "tst_mapplication.moc"
