// SPDX-License-Identifier: Apache-2.0
#include "journal/error.h"
#include "journal/smallfile.h"
#include "processes.h"
#include "world/child.h"
#include "world/world.h"

#include <QDir>
#include <QTemporaryDir>
#include <QtTest>

#include <csignal>

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

using namespace sandbox;

namespace {

constexpr int kLimitMs = 30000;

} // namespace

// Whole worlds, with a shell script in the program's place.
class TestWorld : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void cleanup();

    void refusesToStart_data();
    void refusesToStart();
    void failedStartLeavesNothing();
    void displayWantsItsCookie();
    void nothingOutlivesTheLauncher_data();
    void nothingOutlivesTheLauncher();

private:
    // Longer than the path of a socket can be, and with blanks.
    QString state() const
    {
        return m_directory->filePath(QStringLiteral("检出 的 地方 ").repeated(10) + QLatin1Char('w'));
    }
    // A world that has started.
    void start(const char *scenario = R"({"title": "A plain world"})");

    std::unique_ptr<QTemporaryDir> m_directory;
    WorldOptions m_options;
    std::unique_ptr<World> m_world;
    QString m_error;
};

void TestWorld::init()
{
    m_directory = std::make_unique<QTemporaryDir>();
    m_options = WorldOptions();
    m_options.state = state();
    m_options.scenarioFile = m_directory->filePath(QStringLiteral("scenario.json"));
}

void TestWorld::cleanup()
{
    m_world.reset();
    QCOMPARE(processesLeftWith(m_directory->path()), QStringList());
    m_directory.reset();
}

void TestWorld::start(const char *scenario)
{
    QVERIFY(smallfile::write(m_options.scenarioFile, scenario));
    m_world.reset();
    m_world = std::make_unique<World>(m_options);
    QVERIFY2(attempt(&m_error, [this] { m_world->start(); }), qPrintable(m_error));
}

void TestWorld::refusesToStart_data()
{
    QTest::addColumn<QString>("directory"); // below the test's own
    QTest::addColumn<QByteArray>("json");
    QTest::addColumn<QString>("said");
    const auto row = [](const char *name, const char *state, const char *json, const char *said) {
        QTest::newRow(name) << QString::fromLatin1(state) << QByteArray(json) << QString::fromLatin1(said);
    };
    const char *plain = R"({"title": "A plain world"})";
    row("foreign directory", "foreign", plain, "neither empty nor a world");
    row("file in the way", "scenario.json", plain, "scenario.json");
    row("damaged scenario", "w", "{", "scenario.json");
}

void TestWorld::refusesToStart()
{
    QFETCH(QString, directory);
    QFETCH(QByteArray, json);
    QFETCH(QString, said);
    QVERIFY(smallfile::write(m_options.scenarioFile, json));
    QVERIFY(QDir().mkpath(m_directory->filePath(QStringLiteral("foreign/photos"))));
    m_options.state = m_directory->filePath(directory);
    World world(m_options);
    QVERIFY(!attempt(&m_error, [&world] { world.start(); }));
    QVERIFY2(m_error.contains(said) && !m_error.contains(QLatin1Char('\n')), qPrintable(m_error));
}

// One world in a directory, and one at a port.
void TestWorld::failedStartLeavesNothing()
{
    start();
    World second(m_options);
    QVERIFY(!attempt(&m_error, [&second] { second.start(); }));
    QCOMPARE(m_error, QStringLiteral("another world runs in %1").arg(state()));
    WorldOptions samePort = m_options;
    samePort.state = m_directory->filePath(QStringLiteral("second"));
    samePort.port = m_world->enrolmentPort();
    World third(samePort);
    QVERIFY(!attempt(&m_error, [&third] { third.start(); }));
    QVERIFY(third.state().run().isEmpty() && !m_world->state().run().isEmpty());
    m_world.reset();
    QVERIFY2(attempt(&m_error, [&second] { second.start(); }), qPrintable(m_error));
}

void TestWorld::displayWantsItsCookie()
{
    m_options.virtualDisplay = true;
    start();
    const QByteArray display = m_world->environment().value(QStringLiteral("DISPLAY")).toLatin1();
    const int connection = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_un address{AF_UNIX, {}};
    qstrcpy(address.sun_path, ("/tmp/.X11-unix/X" + display.mid(1)).constData());
    QCOMPARE(::connect(connection, reinterpret_cast<sockaddr *>(&address), sizeof address), 0);
    const char withoutCookie[12] = {'l', 0, 11};
    char accepted = -1;
    QCOMPARE(::write(connection, withoutCookie, sizeof withoutCookie), ssize_t(sizeof withoutCookie));
    QCOMPARE(::read(connection, &accepted, 1), ssize_t(1));
    ::close(connection);
    QCOMPARE(accepted, '\0');
}

void TestWorld::nothingOutlivesTheLauncher_data()
{
    QTest::addColumn<int>("signal");
    QTest::addColumn<int>("exitCode");
    QTest::newRow("TERM") << SIGTERM << 128 + SIGTERM;
    QTest::newRow("INT") << SIGINT << 128 + SIGINT;
    QTest::newRow("KILL") << SIGKILL << SIGKILL; // as QProcess reports the end by a signal
    QTest::newRow("reboot of the terminal") << 0 << 0;
}

void TestWorld::nothingOutlivesTheLauncher()
{
    QFETCH(int, signal);
    QFETCH(int, exitCode);
    const QString program = m_directory->filePath(QStringLiteral("program"));
    QVERIFY(smallfile::write(program,
                             "#!/bin/sh\nsetsid sleep 300 & echo up\n"
                             "until [ -e /tmp/reboot ]; do sleep 0.1; done\n"
                             "dbus-send --system --print-reply --dest=org.freedesktop.login1 "
                             "/org/freedesktop/login1 org.freedesktop.login1.Manager.Reboot boolean:true\n"
                             "wait\n"));
    QVERIFY(QFile::setPermissions(program, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner));
    QProcess launcher;
    launcher.start(findTool(QStringLiteral("vesk-sandbox")),
                   {QStringLiteral("--state"), state(), QStringLiteral("--headless"),
                    QStringLiteral("--program"), program});
    QTRY_COMPARE_WITH_TIMEOUT(
        smallfile::read(state() + QStringLiteral("/program.log")).value_or(QByteArray()), QByteArray("up\n"),
        kLimitMs);
    const QString sockets = StateDirectory(state()).run();
    QVERIFY(QFileInfo(sockets).isDir());
    const QString asked = StateDirectory(state()).inside(QStringLiteral("/tmp/reboot"));
    if (signal == 0)
        QVERIFY(smallfile::write(asked, "now"));
    else
        ::kill(static_cast<pid_t>(launcher.processId()), signal);
    QVERIFY(launcher.waitForFinished(kLimitMs));
    QCOMPARE(launcher.exitCode(), exitCode);
    QCOMPARE(processesLeftWith(m_directory->path()), QStringList());
    QCOMPARE(QFileInfo::exists(sockets), signal == SIGKILL);
    QVERIFY(!QFileInfo::exists(asked)); // a reboot empties /tmp
    start();
    QVERIFY(!QFileInfo::exists(sockets)); // the next start removes them
}

QTEST_GUILESS_MAIN(TestWorld)
#include "tst_world.moc"
