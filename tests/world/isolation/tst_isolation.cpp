// SPDX-License-Identifier: Apache-2.0
#include "processes.h"

#include <QFileInfo>
#include <QProcess>
#include <QTemporaryDir>
#include <QtTest>

#include <unistd.h>

namespace {

constexpr int kLimitMs = 30000;
const QString kIsolate = QStringLiteral(VESK_ISOLATE);

QStringList words(const char *line)
{
    return QString::fromUtf8(line).split(QLatin1Char(' '), Qt::SkipEmptyParts);
}

// What it says on standard output, once it has ended.
QString finish(QProcess *process)
{
    if (!process->waitForFinished(kLimitMs)) {
        process->kill();
        process->waitForFinished(kLimitMs);
        return QStringLiteral("does not end");
    }
    return QString::fromUtf8(process->readAllStandardOutput());
}

// A user and a tool: how the command line begins that starts vesk-isolate so.
using Setting = QStringList;

QString nameOf(const Setting &setting)
{
    return (setting.first() == kIsolate ? QStringLiteral("self") : QStringLiteral("nobody")) + setting.last();
}

// Empty when the machine itself, without vesk-isolate, lets the user run the tool; else why not. A container
// may grant no namespaces or tracing, and a checkout may be closed to others.
QString refusalOf(const QStringList &user, const QString &tool)
{
    const QStringList trial =
        tool == QLatin1String("--bwrap")
            ? words("bwrap --unshare-pid --unshare-ipc --ro-bind / / --dev /dev --proc /proc")
            : words("proot -v -1");
    const QStringList command = user + trial + words("test -x") + QStringList{kIsolate};
    QProcess process;
    process.start(command.first(), command.mid(1));
    if (process.waitForFinished(kLimitMs) && process.exitStatus() == QProcess::NormalExit &&
        process.exitCode() == 0)
        return {};
    const QString said = QString::fromLocal8Bit(process.readAllStandardError()).trimmed();
    return said.isEmpty() ? QStringLiteral("its trial fails") : said;
}

// All of them, with the machine's refusal.
const QVector<std::pair<Setting, QString>> &allSettings()
{
    static const auto found = [] {
        QVector<std::pair<Setting, QString>> all;
        const QStringList nobody = words("setpriv --reuid=65534 --regid=65534 --clear-groups");
        for (const QStringList &user :
             ::getuid() == 0 ? QList<QStringList>{{}, nobody} : QList<QStringList>{{}}) {
            for (const char *tool : {"--bwrap", "--proot"})
                all.append({user + QStringList{kIsolate, QLatin1String(tool)},
                            refusalOf(user, QLatin1String(tool))});
        }
        return all;
    }();
    return found;
}

// What proot has made in /tmp since `before`, and whose process is gone.
QStringList remainsOfProot(const QStringList &before = {})
{
    QStringList remains;
    for (const QString &name : QDir(QStringLiteral("/tmp")).entryList({QStringLiteral("proot*-*-*")})) {
        const QString process = QStringLiteral("/proc/") + name.section(QLatin1Char('-'), 1, 1);
        if (!QFileInfo::exists(process) && !before.contains(name))
            remains.append(name);
    }
    return remains;
}

QString ipcNamespace()
{
    return QFileInfo(QFileInfo(QStringLiteral("/proc/self/ns/ipc")).symLinkTarget()).fileName();
}

void addRow(const char *name, const std::function<void(QTestData &row, const Setting &setting)> &fill)
{
    for (const auto &[setting, refusal] : allSettings()) {
        if (refusal.isEmpty())
            fill(QTest::addRow("%s, %s", name, qPrintable(nameOf(setting))), setting);
    }
}

} // namespace

// vesk-isolate as its callers use it, with each tool and as each user, where the machine allows it.
class TestIsolation : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase();
    void init();
    void cleanup() { m_directory.reset(); }

    void machineGrants_data();
    void machineGrants();
    void keepsApart_data();
    void keepsApart();
    void terminalIsOutOfReach_data() { addSettings(); }
    void terminalIsOutOfReach();
    void termReachesTheCommand_data() { addSettings(); }
    void termReachesTheCommand();
    void nothingOutlivesIt_data();
    void nothingOutlivesIt();
    void refusesNonsense_data();
    void refusesNonsense();

private:
    static void addSettings();
    // "DIR" in the options is the test's own directory.
    QStringList commandLine(const Setting &setting, const char *options, const QString &script) const;
    void start(QProcess *process, const QStringList &command) const;

    std::unique_ptr<QTemporaryDir> m_directory;
};

void TestIsolation::initTestCase()
{
    QStringList refusals;
    for (const auto &[setting, refusal] : allSettings()) {
        if (refusal.isEmpty())
            return;
        refusals.append(nameOf(setting) + QLatin1String(": ") + refusal);
    }
    QSKIP(qPrintable(refusals.join(QLatin1String("; "))));
}

// Below /tmp, which an ordinary user reaches and which is itself replaced inside.
void TestIsolation::init()
{
    m_directory = std::make_unique<QTemporaryDir>(QStringLiteral("/tmp/vesk-isolation-XXXXXX"));
    QProcess shell;
    start(&shell, words("sh -c") << QStringLiteral(
                      "mkdir -p root/etc bare writable temporary session/secret session/wayland-7 && "
                      "echo kiosk-7 >root/etc/hostname && chmod -R a+rwX . && chmod 755 ."));
    finish(&shell);
    QCOMPARE(shell.exitCode(), 0);
}

void TestIsolation::addSettings()
{
    QTest::addColumn<Setting>("setting");
    addRow("with", [](QTestData &row, const Setting &setting) { row << setting; });
}

QStringList TestIsolation::commandLine(const Setting &setting, const char *options,
                                       const QString &script) const
{
    QStringList given = words(options);
    given.replaceInStrings(QStringLiteral("DIR"), m_directory->path());
    return setting + given + words("-- /bin/bash -c") + QStringList{script};
}

void TestIsolation::start(QProcess *process, const QStringList &command) const
{
    const auto in = [this](const char *name, const char *directory) {
        return QLatin1String(name) + m_directory->filePath(QLatin1String(directory));
    };
    process->setWorkingDirectory(m_directory->path());
    process->start(QStringLiteral("env"),
                   QStringList{in("TMPDIR=", "temporary"), in("XDG_RUNTIME_DIR=", "session"),
                               QStringLiteral("WAYLAND_DISPLAY=wayland-7")} +
                       command);
}

void TestIsolation::machineGrants_data()
{
    QTest::addColumn<QString>("refusal");
    for (const auto &[setting, refusal] : allSettings())
        QTest::newRow(qPrintable(nameOf(setting))) << refusal;
}

// Skips what the other tests leave out.
void TestIsolation::machineGrants()
{
    QFETCH(QString, refusal);
    if (!refusal.isEmpty())
        QSKIP(qPrintable(refusal));
}

void TestIsolation::keepsApart_data()
{
    QTest::addColumn<QStringList>("setting");
    QTest::addColumn<QByteArray>("options");
    QTest::addColumn<QString>("inside"); // a script, and what it prints
    QTest::addColumn<QString>("seen");
    QTest::addColumn<int>("exitCode");
    QTest::addColumn<QString>("outside"); // the same, run afterwards on the machine, in the test's directory
    QTest::addColumn<QString>("left");
    const auto row = [](const char *name, const char *inside, const char *seen, int exitCode = 0,
                        const char *options = "--root DIR/root", const char *outside = "",
                        const char *left = "") {
        addRow(name, [&](QTestData &data, const Setting &setting) {
            const QString script = QString::fromUtf8(inside)
                                       .replace(QLatin1String("TOOL"), setting.last())
                                       .replace(QLatin1String("OUTER_IPC"), ipcNamespace());
            data << setting << QByteArray(options) << script << QString::fromUtf8(seen) << exitCode
                 << QString::fromUtf8(outside) << QString::fromUtf8(left);
        });
    };
    row("exit code", "exit 42", "", 42);
    row("signal", "kill -KILL $$", "", 137);
    row("no such command", "exec /nonexistent", "", 127);
    row("directories are empty and own",
        "ls -A /etc/vesk /usr/share/vesk; test -O /etc/vesk -a -O /tmp && echo mine",
        "/etc/vesk:\n\n/usr/share/vesk:\nmine\n");
    row("modes", "stat -c %a /etc/vesk /usr/share/vesk /tmp", "755\n755\n1777\n");
    // stat, mv and test use the calls that path translation does not know.
    row("new system calls",
        "cd /etc/vesk; echo 1 > a; mv -n a b; stat -c %s b; test -r b -a ! -e a && echo good", "2\ngood\n");
    row("temporary directory", "echo ${TMPDIR-none}; f=$(mktemp); dirname $f", "none\n/tmp\n");
    row("rest of the machine",
        "test -x /bin/sh -a -d /usr/lib -a -e /proc/self/exe -a -c /dev/null && echo there", "there\n");
    row("buses are out of reach", "echo $DBUS_SYSTEM_BUS_ADDRESS $DBUS_SESSION_BUS_ADDRESS; ls -A /run",
        "unix:path=/nonexistent unix:path=/nonexistent\n");
    row("of the session the display only",
        "cd $XDG_RUNTIME_DIR; stat -c %a .; test -e wayland-7 -a ! -e secret && echo good", "700\ngood\n");
    row("no capabilities", "grep -E 'Cap(Inh|Prm|Eff|Amb)|NoNewPrivs' /proc/self/status | tr -d '\\t'",
        "CapInh:0000000000000000\nCapPrm:0000000000000000\nCapEff:0000000000000000\n"
        "CapAmb:0000000000000000\nNoNewPrivs:1\n");
    row("absent files are absent", "test ! -e /etc/hostname -a ! -e /etc/hosts && echo absent", "absent\n", 0,
        "--root DIR/bare");
    row("root keeps what is written",
        "for d in /etc/vesk /usr/share/vesk /tmp; do echo kept >$d/$MARK; done; echo written >/etc/hostname",
        "", 0, "--root DIR/root --setenv MARK=vesk-isolation-mark",
        "cd root; cat etc/vesk/*-mark usr/share/vesk/*-mark etc/hostname; ls -A tmp; "
        "ls /etc/vesk/vesk-isolation-mark /usr/share/vesk/vesk-isolation-mark /tmp/vesk-isolation-mark",
        "kept\nkept\nwritten\nvesk-isolation-mark\n"); // and no mount points
    row("fresh root is removed", "echo x > /etc/vesk/x; cat /etc/hostname /etc/vesk/x", "terminal-01\nx\n", 0,
        "", "ls -A temporary");
    row("files can be shown and written", "echo in > $HERE/file; cat /usr/share/vesk/shown/file", "in\n", 0,
        "--root DIR/root --writable DIR/writable --bind DIR/writable:/usr/share/vesk/shown --setenv "
        "HERE=DIR/writable",
        "cat writable/file", "in\n");
    // What the manual page lists, and proot cannot do. No file on a read-only mount can be written, but
    // sockets and pipes there can.
    row("machine is read-only",
        "[ TOOL = --proot ] || {\n"
        "awk '$6 !~ /^ro/ { print $5 }' /proc/self/mountinfo | grep -v ^/dev/\n"
        "find /proc /sys -type f -writable\n"
        "find /dev -type b -o -type c | grep -vxE '/dev/(null|zero|full|u?random|tty|console|pts/.*)'\n"
        "[ OUTER_IPC != \"$(readlink /proc/self/ns/ipc)\" ] || echo shared memory; } | grep -vxE "
        "\"/dev|/etc/(vesk|hostname|hosts)|/usr/share/vesk|/tmp|/run|$XDG_RUNTIME_DIR|$HERE\"; true",
        "", 0, "--root DIR/root --writable DIR/writable --setenv HERE=DIR/writable");
}

void TestIsolation::keepsApart()
{
    QFETCH(QStringList, setting);
    QFETCH(QByteArray, options);
    QFETCH(QString, inside);
    QFETCH(QString, seen);
    QFETCH(int, exitCode);
    QFETCH(QString, outside);
    QFETCH(QString, left);
    QProcess process;
    start(&process, commandLine(setting, options.constData(), inside));
    QCOMPARE(finish(&process), seen);
    QVERIFY2(process.exitCode() == exitCode, process.readAllStandardError().constData());
    QProcess shell;
    start(&shell, words("sh -c") << outside);
    QCOMPARE(finish(&shell), left);
}

// A character that TIOCSTI puts into the input of a terminal is typed into the shell that the user returns
// to.
void TestIsolation::terminalIsOutOfReach()
{
    QFETCH(QStringList, setting);
    QStringList command =
        commandLine(setting, "--root DIR/root",
                    QStringLiteral("test -t 0 && echo shown; : 2>/dev/null </dev/tty || echo not its own; "
                                   "perl -e '$x = q(x); ioctl(STDIN, 0x5412, $x) or print qq(refused\\n)'"));
    for (QString &word : command)
        word =
            QLatin1Char('\'') + word.replace(QLatin1Char('\''), QLatin1String("'\\''")) + QLatin1Char('\'');
    QProcess process;
    start(&process, words("script -qec") << command.join(QLatin1Char(' ')) << QStringLiteral("/dev/null"));
    QCOMPARE(finish(&process).remove(QLatin1Char('\r')), QStringLiteral("shown\nnot its own\nrefused\n"));
}

void TestIsolation::termReachesTheCommand()
{
    QFETCH(QStringList, setting);
    QProcess process;
    start(&process, commandLine(setting, "--root DIR/root",
                                QStringLiteral("trap 'echo ended in order; exit 5' TERM; echo ready; "
                                               "while :; do sleep 0.05; done")));
    QVERIFY(process.waitForReadyRead(kLimitMs));
    process.terminate();
    QCOMPARE(finish(&process), QStringLiteral("ready\nended in order\n"));
    QCOMPARE(process.exitCode(), 5);
}

void TestIsolation::nothingOutlivesIt_data()
{
    QTest::addColumn<QStringList>("setting");
    QTest::addColumn<bool>("killed");
    addRow("end", [](QTestData &row, const Setting &setting) { row << setting << false; });
    addRow("kill -9", [](QTestData &row, const Setting &setting) { row << setting << true; });
}

void TestIsolation::nothingOutlivesIt()
{
    QFETCH(QStringList, setting);
    QFETCH(bool, killed);
    const auto machine = [] {
        return QList<bool>{QFileInfo::exists(QStringLiteral("/etc/vesk")),
                           QFileInfo::exists(QStringLiteral("/usr/share/vesk"))};
    };
    const QList<bool> before = machine();
    const QStringList remained = remainsOfProot();
    // A number of seconds that no other process on this machine waits for.
    const QString sleep = QStringLiteral("sleep 7%1").arg(QCoreApplication::applicationPid());
    QProcess process;
    start(&process, commandLine(setting, "--root DIR/root",
                                QStringLiteral("setsid %1 & echo ready; read line").arg(sleep)));
    QVERIFY(process.waitForReadyRead(kLimitMs));
    QTRY_VERIFY(!processesWith(sleep).isEmpty());
    QCOMPARE(machine(), before); // no mount point is made on the machine, not even for a while
    if (killed)
        process.kill();
    else
        process.write("\n");
    finish(&process);
    QTRY_COMPARE_WITH_TIMEOUT(processesWith(sleep), QStringList(), kLimitMs);
    QTRY_COMPARE(remainsOfProot(remained), QStringList());
    QCOMPARE(machine(), before);
}

void TestIsolation::refusesNonsense_data()
{
    QTest::addColumn<QString>("said");
    const auto row = [](const char *arguments, const char *said) {
        QTest::newRow(arguments) << QString::fromUtf8(said);
    };
    row("--bwrap", "no command given");
    row("--", "no command given");
    row("ls /", "unknown argument ls");
    row("--root", "Missing value after '--root'");
    row("--bind /nonexistent:/x -- true", "cannot bind /nonexistent");
    row("--bind /etc:x -- true", "x is not an absolute path");
    row("--bind /etc -- true", "there is no \":\" in it");
    row("--setenv =x -- true", "there is no \"=\" in it");
    row("--root /dev/null/x -- true", "cannot create /dev/null/x");
}

void TestIsolation::refusesNonsense()
{
    QFETCH(QString, said);
    QProcess process;
    start(&process, QStringList{kIsolate} + words(QTest::currentDataTag()));
    finish(&process);
    const QString errors = QString::fromUtf8(process.readAllStandardError());
    QCOMPARE(process.exitCode(), 125);
    QVERIFY2(errors.startsWith(QLatin1String("vesk-isolate: ")) && errors.contains(said), qPrintable(errors));
}

QTEST_GUILESS_MAIN(TestIsolation)
#include "tst_isolation.moc"
