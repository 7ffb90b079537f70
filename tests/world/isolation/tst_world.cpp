// SPDX-License-Identifier: Apache-2.0
#include "certificateauthority.h"
#include "processes.h"
#include "world/tools.h"
#include "world/world.h"

#include <QDir>
#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>
#include <QTemporaryDir>
#include <QtTest>

#include <csignal>

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

using namespace sandbox;

namespace {

constexpr int kLimitMs = 30000;

QByteArray readFile(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

bool writeFile(const QString &path, const QByteArray &content)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(content) == content.size();
}

// Calls the login manager as the program does.
constexpr char kReboot[] = "dbus-send --system --print-reply --dest=org.freedesktop.login1 "
                           "/org/freedesktop/login1 org.freedesktop.login1.Manager.Reboot boolean:true\n"
                           "sleep 300\n";

} // namespace

// Whole worlds, with a shell script in the program's place.
class TestWorld : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void cleanup() { m_folder.reset(); }

    void programSeesItsWorld();
    void secondStartFindsTheRecord();
    void rebootEmptiesTmp();
    void refusesToStart_data();
    void refusesToStart();
    void oneWorldInAFolder();
    void failedStartLeavesNothing();
    void displayWantsItsCookie();
    void scenarioFiles();
    void nothingOutlivesTheLauncher_data();
    void nothingOutlivesTheLauncher();
    void launcherEndsWithReboot();

private:
    // Longer than the path of a socket can be, and with blanks.
    QString state() const
    {
        return m_folder->filePath(QStringLiteral("检出 的 地方 ").repeated(10) + QLatin1Char('w'));
    }
    WorldOptions options() const;
    // What the script printed, or why it did not run.
    static QString runInside(World *world, const char *script);
    QString scenario(const char *json) const;
    void startLauncher(QProcess *process, const char *script) const;

    std::unique_ptr<QTemporaryDir> m_folder;
};

void TestWorld::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    QVERIFY(m_folder->isValid());
    scenario(R"({"title": "A plain world"})");
}

QString TestWorld::scenario(const char *json) const
{
    const QString path = m_folder->filePath(QStringLiteral("scenario.json"));
    return writeFile(path, json) ? path : QString();
}

WorldOptions TestWorld::options() const
{
    WorldOptions result;
    result.state = state();
    result.scenarioFile = m_folder->filePath(QStringLiteral("scenario.json"));
    return result;
}

QString TestWorld::runInside(World *world, const char *script)
{
    QString error;
    QFile::remove(world->state().programLog());
    QSignalSpy ended(world, &World::programEnded);
    if (!world->startProgram({QStringLiteral("/bin/sh"), QStringLiteral("-c"), QString::fromUtf8(script)},
                             &error))
        return error;
    if (ended.isEmpty() && !ended.wait(kLimitMs))
        return QStringLiteral("the script does not end");
    return QString::fromUtf8(readFile(world->state().programLog()));
}

void TestWorld::programSeesItsWorld()
{
    World world(options());
    QString error;
    QVERIFY2(world.start(&error), qPrintable(error));
    const QString seen =
        runInside(&world, "test -s /usr/share/vesk/machine.txt && cat /etc/hostname; echo $HOME; "
                          "which gsettings; gsettings get com.morvek.mde.control-center "
                          "auto-login-visable; echo staged > /tmp/staged");
    QCOMPARE(seen, QStringLiteral("terminal-01\n%1/home\n%1/commands/gsettings\ntrue\n").arg(state()));
    QCOMPARE(readFile(world.state().inside(QStringLiteral("/tmp/staged"))), QByteArray("staged\n"));
    QVERIFY(readFile(world.state().journal().path())
                .contains(
                    " command   gsettings get com.morvek.mde.control-center auto-login-visable -> exit 0\n"));
    const QString sockets = world.state().run();
    QVERIFY(QFileInfo(sockets).isDir());
    world.stop();
    QCOMPARE(processesLeftWith(state()), QStringList());
    QVERIFY(!QFileInfo::exists(sockets) && world.state().run().isEmpty());
}

// A join as veskg sees it, then the same world once more.
void TestWorld::secondStartFindsTheRecord()
{
    const auto ca = CertificateAuthority::create(QStringLiteral("Test CA"), nullptr);
    QVERIFY(ca);
    const auto pair = ca->issueClient(QStringLiteral("terminal"), nullptr);
    QVERIFY(pair);
    QByteArray machine;
    quint16 port = 0;
    {
        World world(options());
        QString error;
        QVERIFY2(world.start(&error), qPrintable(error));
        const QString staging = world.state().inside(QStringLiteral("/tmp/vesk/"));
        QVERIFY(QDir().mkpath(staging) &&
                writeFile(staging + QStringLiteral("clientapi_ca.crt"), ca->certificatePem()));
        QVERIFY(writeFile(staging + QStringLiteral("client.crt"), pair->certificatePem));
        QVERIFY(writeFile(staging + QStringLiteral("client.key"), pair->keyPem));
        QVERIFY(writeFile(staging + QStringLiteral("userinfo.json"), R"({"is_Domain": true})"));
        const QString reply = runInside(
            &world, "dbus-send --system --print-reply --dest=com.morvek.vesk.veskg /com/morvek/vesk/veskg "
                    "com.morvek.vesk.veskg.onDomainConfig string:copyConfig");
        QVERIFY2(reply.contains(QStringLiteral("int32 0")), qPrintable(reply));
        machine = readFile(world.state().inside(QStringLiteral("/usr/share/vesk/machine.txt")));
        port = world.enrolmentPort();
    }
    World world(options());
    QString error;
    QVERIFY2(world.start(&error), qPrintable(error));
    QCOMPARE(runInside(&world, "cat /etc/vesk/userinfo.json; cat /usr/share/vesk/machine.txt"),
             QStringLiteral("{\"is_Domain\": true}") + QString::fromUtf8(machine));
    QCOMPARE(world.enrolmentPort(), port);
}

void TestWorld::rebootEmptiesTmp()
{
    World world(options());
    QString error;
    QVERIFY2(world.start(&error), qPrintable(error));
    const QString said =
        runInside(&world, "mkdir -p /tmp/vesk; echo 1 > /tmp/vesk/file; echo 1 > /tmp/.hidden; "
                          "ln -s /etc/passwd /tmp/link; echo 1 > /etc/vesk/kept");
    QCOMPARE(said, QString());
    world.reboot();
    const QDir tmp(world.state().inside(QStringLiteral("/tmp")));
    QCOMPARE(tmp.entryList(QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot),
             QStringList());
    QCOMPARE(readFile(world.state().inside(QStringLiteral("/etc/vesk/kept"))), QByteArray("1\n"));
}

void TestWorld::refusesToStart_data()
{
    QTest::addColumn<QString>("folder"); // below the test's own
    QTest::addColumn<QByteArray>("json");
    QTest::addColumn<QString>("said");
    const QByteArray plain = R"({"title": "A plain world"})";
    QTest::newRow("foreign folder") << QStringLiteral("foreign") << plain
                                    << QStringLiteral("other things than a world");
    QTest::newRow("file in the way") << QStringLiteral("scenario.json") << plain
                                     << QStringLiteral("scenario.json");
    QTest::newRow("damaged scenario")
        << QStringLiteral("w") << QByteArray("{") << QStringLiteral("scenario.json");
    QTest::newRow("file of the machine")
        << QStringLiteral("w") << QByteArray(R"({"title": "t", "files": {"/opt/file": ""}})")
        << QStringLiteral("no /opt/file of its own");
    QTest::newRow("file that climbs out")
        << QStringLiteral("w") << QByteArray(R"({"title": "t", "files": {"/tmp/../../file": ""}})")
        << QStringLiteral("no /tmp/../../file of its own");
}

void TestWorld::refusesToStart()
{
    QFETCH(QString, folder);
    QFETCH(QByteArray, json);
    QFETCH(QString, said);
    scenario(json.constData());
    QVERIFY(QDir().mkpath(m_folder->filePath(QStringLiteral("foreign/photos"))));
    WorldOptions wanted = options();
    wanted.state = m_folder->filePath(folder);
    World world(wanted);
    QString error;
    QVERIFY(!world.start(&error));
    QVERIFY2(error.contains(said) && !error.contains(QLatin1Char('\n')), qPrintable(error));
    QCOMPARE(processesLeftWith(m_folder->path()), QStringList());
}

void TestWorld::oneWorldInAFolder()
{
    QString error;
    World second(options());
    {
        World first(options());
        QVERIFY2(first.start(&error), qPrintable(error));
        QVERIFY(!second.start(&error));
        QCOMPARE(error, QStringLiteral("another world runs in %1").arg(state()));
    }
    QVERIFY2(second.start(&error), qPrintable(error));
}

void TestWorld::failedStartLeavesNothing()
{
    QString error;
    World first(options());
    QVERIFY2(first.start(&error), qPrintable(error));
    WorldOptions samePort = options();
    samePort.state = m_folder->filePath(QStringLiteral("second"));
    samePort.port = first.enrolmentPort();
    World second(samePort);
    QVERIFY(!second.start(&error));
    QVERIFY(second.state().run().isEmpty() && !first.state().run().isEmpty());
}

void TestWorld::displayWantsItsCookie()
{
    WorldOptions wanted = options();
    wanted.virtualDisplay = true;
    World world(wanted);
    QString error;
    QVERIFY2(world.start(&error), qPrintable(error));
    const QByteArray display = world.environment().value(QStringLiteral("DISPLAY")).toLatin1();
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

void TestWorld::scenarioFiles()
{
    scenario(R"({"title": "t", "files": {"/etc/hostname": null, "/usr/share/vesk/machine.txt": "",
                                         "/etc/vesk/userinfo.json": "{\"is_Domain\": true}"},
                 "schema": {"without": ["auto-login-visable"]}, "commands": {"id": {"output": "uid=7", "exit": 3}}})");
    World world(options());
    QString error;
    QVERIFY2(world.start(&error), qPrintable(error));
    QCOMPARE(runInside(&world, "test -e /etc/hostname || echo no name; wc -c < /usr/share/vesk/machine.txt; "
                               "cat /etc/vesk/userinfo.json; id; echo /$?; "
                               "gsettings list-keys com.morvek.mde.control-center"),
             QStringLiteral("no name\n0\n{\"is_Domain\": true}uid=7/3\nnopasswd-login-visable\n"));
}

void TestWorld::nothingOutlivesTheLauncher_data()
{
    QTest::addColumn<int>("signal");
    QTest::addColumn<int>("exitCode");
    QTest::newRow("TERM") << SIGTERM << 128 + SIGTERM;
    QTest::newRow("INT") << SIGINT << 128 + SIGINT;
    QTest::newRow("KILL") << SIGKILL << SIGKILL; // as QProcess reports the end by a signal
}

void TestWorld::startLauncher(QProcess *process, const char *script) const
{
    const QString program = m_folder->filePath(QStringLiteral("program"));
    QVERIFY(writeFile(program, QByteArray("#!/bin/sh\n") + script));
    QVERIFY(QFile::setPermissions(program, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner));
    QString error;
    const QString launcher = findTool(QStringLiteral("vesk-sandbox"), &error);
    QVERIFY2(!launcher.isEmpty(), qPrintable(error));
    process->start(launcher, {QStringLiteral("--state"), state(), QStringLiteral("--headless"),
                              QStringLiteral("--program"), program, QStringLiteral("--scenario"),
                              m_folder->filePath(QStringLiteral("scenario.json"))});
}

void TestWorld::nothingOutlivesTheLauncher()
{
    QFETCH(int, signal);
    QFETCH(int, exitCode);
    QProcess launcher;
    startLauncher(&launcher, "setsid sleep 300 & echo up; wait\n");
    if (QTest::currentTestFailed())
        return;
    const QString log = state() + QStringLiteral("/program.log");
    QTRY_COMPARE_WITH_TIMEOUT(readFile(log), QByteArray("up\n"), kLimitMs);
    const QString sockets = StateFolder(state()).run();
    QVERIFY(QFileInfo(sockets).isDir());
    ::kill(static_cast<pid_t>(launcher.processId()), signal);
    QVERIFY(launcher.waitForFinished(kLimitMs));
    QCOMPARE(launcher.exitCode(), exitCode);
    QCOMPARE(processesLeftWith(m_folder->path()), QStringList());
    QCOMPARE(QFileInfo::exists(sockets), signal == SIGKILL);
    World next(options());
    QString error;
    QVERIFY2(next.start(&error), qPrintable(error));
    QVERIFY(!QFileInfo::exists(sockets)); // the next start removes them
}

void TestWorld::launcherEndsWithReboot()
{
    QProcess launcher;
    startLauncher(&launcher, kReboot);
    if (QTest::currentTestFailed())
        return;
    QVERIFY(launcher.waitForFinished(kLimitMs));
    QCOMPARE(launcher.exitCode(), 0);
    QVERIFY(launcher.readAllStandardOutput().contains("\nthe terminal asked for a reboot: the run ends\n"));
    QVERIFY(readFile(state() + QStringLiteral("/journal.log"))
                .contains(" bus       org.freedesktop.login1 Reboot(true)\n"));
    QCOMPARE(processesLeftWith(state()), QStringList());
}

QTEST_GUILESS_MAIN(TestWorld)
#include "tst_world.moc"
