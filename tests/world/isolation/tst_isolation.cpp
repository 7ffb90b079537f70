// SPDX-License-Identifier: Apache-2.0
#include "processes.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QProcess>
#include <QTemporaryDir>
#include <QtTest>

#include <csignal>

#include <sys/stat.h>
#include <unistd.h>

namespace {

constexpr int kLimitMs = 30000;

struct Result
{
    int exitCode = -1;
    QString output;
    QString errors;
};

Result finish(QProcess *process)
{
    if (!process->waitForFinished(kLimitMs)) {
        process->kill();
        process->waitForFinished(kLimitMs);
        return {-1, QStringLiteral("does not end"), {}};
    }
    return {process->exitCode(), QString::fromUtf8(process->readAllStandardOutput()),
            QString::fromUtf8(process->readAllStandardError())};
}

// A user and a tool, and the command line that starts vesk-isolate so.
struct Setting
{
    QString name;
    QStringList prefix;
    QStringList tool;

    bool isReadOnly() const { return tool == QStringList{QStringLiteral("--bwrap")}; }
};

QStringList asNobody()
{
    return {QStringLiteral("setpriv"), QStringLiteral("--reuid=65534"), QStringLiteral("--regid=65534"),
            QStringLiteral("--clear-groups")};
}

bool works(const QStringList &prefix, const QString &tool)
{
    const QStringList command = prefix + QStringList{QStringLiteral(VESK_ISOLATE), tool, QStringLiteral("--"),
                                                     QStringLiteral("true")};
    QProcess process;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("TMPDIR"), QStringLiteral("/tmp"));
    process.setProcessEnvironment(environment);
    process.start(command.first(), command.mid(1));
    return process.waitForFinished(kLimitMs) && process.exitCode() == 0;
}

// A container may grant no namespaces and a checkout may be closed to others; what works is tested.
QList<Setting> settings()
{
    static QList<Setting> found;
    if (!found.isEmpty())
        return found;
    QList<QStringList> users{{}};
    if (::getuid() == 0)
        users.append(asNobody());
    for (const QStringList &user : users) {
        for (const char *tool : {"--bwrap", "--proot"}) {
            if (works(user, QLatin1String(tool)))
                found.append({QLatin1String(user.isEmpty() ? "self" : "nobody") + QLatin1String(tool + 1),
                              user,
                              {QLatin1String(tool)}});
        }
    }
    return found;
}

// The replaced folders that this machine has of its own.
QStringList machineFolders()
{
    QStringList found;
    for (const char *path : {"/etc/vesk", "/usr/share/vesk"}) {
        if (QFileInfo::exists(QLatin1String(path)))
            found.append(QLatin1String(path));
    }
    return found;
}

QString readFile(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QStringLiteral("<absent>");
}

} // namespace

// vesk-isolate as its callers use it, with each tool and as each user that this machine allows.
class TestIsolation : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void initTestCase() { QVERIFY(!settings().isEmpty()); }
    void init();
    void cleanup() { m_folder.reset(); }

    void insideIsOwn_data();
    void insideIsOwn();
    void rootKeepsWhatIsWritten_data() { addSettings(); }
    void rootKeepsWhatIsWritten();
    void terminalIsOutOfReach_data() { addSettings(); }
    void terminalIsOutOfReach();
    void absentFilesAreAbsent_data() { addSettings(); }
    void absentFilesAreAbsent();
    void freshRootIsRemoved_data() { addSettings(); }
    void freshRootIsRemoved();
    void machineIsReadOnly_data() { addSettings(); }
    void machineIsReadOnly();
    void termReachesTheCommand_data() { addSettings(); }
    void termReachesTheCommand();
    void nothingOutlivesIt_data();
    void nothingOutlivesIt();
    void refusesNonsense_data();
    void refusesNonsense();

private:
    static void addSettings();
    QStringList commandLine(const Setting &setting, const QStringList &options, const QString &script) const;
    void prepare(QProcess *process) const;
    Result run(const Setting &setting, const QStringList &options, const QString &script) const;
    QString root() const { return m_folder->filePath(QStringLiteral("root")); }
    QString markOf(const QString &seconds) const { return QStringLiteral("sleep ") + seconds; }

    std::unique_ptr<QTemporaryDir> m_folder;
};

Q_DECLARE_METATYPE(Setting)

// Below /tmp, which an ordinary user reaches and which is itself replaced inside.
void TestIsolation::init()
{
    m_folder = std::make_unique<QTemporaryDir>(QStringLiteral("/tmp/vesk-isolation-XXXXXX"));
    QVERIFY(m_folder->isValid());
    for (const char *folder : {"root/etc", "writable", "temporary", "session/secret", "session/wayland-7"}) {
        const QString path = m_folder->filePath(QLatin1String(folder));
        QVERIFY(QDir().mkpath(path));
        ::chmod(QFile::encodeName(path).constData(), 0777);
    }
    ::chmod(QFile::encodeName(root()).constData(), 0777);
    ::chmod(QFile::encodeName(m_folder->path()).constData(), 0755);
    QFile hostname(root() + QStringLiteral("/etc/hostname"));
    QVERIFY(hostname.open(QIODevice::WriteOnly) && hostname.write("kiosk-7\n") == 8);
}

void TestIsolation::addSettings()
{
    QTest::addColumn<Setting>("setting");
    for (const Setting &setting : settings())
        QTest::newRow(qPrintable(setting.name)) << setting;
}

QStringList TestIsolation::commandLine(const Setting &setting, const QStringList &options,
                                       const QString &script) const
{
    return setting.prefix + QStringList{QStringLiteral(VESK_ISOLATE)} + setting.tool + options +
           QStringList{QStringLiteral("--"), QStringLiteral("/bin/bash"), QStringLiteral("-c"), script};
}

void TestIsolation::prepare(QProcess *process) const
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("TMPDIR"), m_folder->filePath(QStringLiteral("temporary")));
    environment.insert(QStringLiteral("XDG_RUNTIME_DIR"), m_folder->filePath(QStringLiteral("session")));
    environment.insert(QStringLiteral("WAYLAND_DISPLAY"), QStringLiteral("wayland-7"));
    process->setProcessEnvironment(environment);
    process->setWorkingDirectory(QStringLiteral("/"));
}

Result TestIsolation::run(const Setting &setting, const QStringList &options, const QString &script) const
{
    QProcess process;
    prepare(&process);
    const QStringList command = commandLine(setting, options, script);
    process.start(command.first(), command.mid(1));
    return finish(&process);
}

void TestIsolation::insideIsOwn_data()
{
    QTest::addColumn<Setting>("setting");
    QTest::addColumn<QString>("script");
    QTest::addColumn<QString>("output");
    QTest::addColumn<int>("exitCode");
    const auto row = [](const char *name, const char *script, const char *output, int exitCode = 0) {
        for (const Setting &setting : settings())
            QTest::addRow("%s %s", name, qPrintable(setting.name))
                << setting << QString::fromUtf8(script) << QString::fromUtf8(output) << exitCode;
    };
    row("exit code", "exit 42", "", 42);
    row("signal", "kill -KILL $$", "", 137);
    row("no such command", "exec /nonexistent", "", 127);
    row("folders are empty and own",
        "ls -A /etc/vesk /usr/share/vesk; test -O /etc/vesk -a -O /tmp && echo mine",
        "/etc/vesk:\n\n/usr/share/vesk:\nmine\n");
    row("modes", "stat -c %a /etc/vesk /usr/share/vesk /tmp", "755\n755\n1777\n");
    row("host name", "cat /etc/hostname", "kiosk-7\n");
    row("file can be replaced", "rm /etc/hostname; echo other > /etc/hostname; cat /etc/hostname", "other\n");
    // stat, mv and test use the calls that path translation does not know.
    row("new system calls",
        "cd /etc/vesk; echo 1 > a; mv -n a b; stat -c %s b; test -r b -a ! -e a && echo good", "2\ngood\n");
    row("temporary folder", "echo ${TMPDIR-none}; f=$(mktemp); dirname $f", "none\n/tmp\n");
    row("rest of the machine",
        "test -x /bin/sh -a -d /usr/lib -a -e /proc/self/exe -a -c /dev/null && echo there", "there\n");
    row("buses are out of reach", "echo $DBUS_SYSTEM_BUS_ADDRESS $DBUS_SESSION_BUS_ADDRESS; ls -A /run",
        "unix:path=/nonexistent unix:path=/nonexistent\n");
    row("of the session the display only",
        "cd $XDG_RUNTIME_DIR; stat -c %a .; test -e wayland-7 -a ! -e secret && echo good", "700\ngood\n");
    row("no capabilities", "grep -E 'Cap(Inh|Prm|Eff|Amb)|NoNewPrivs' /proc/self/status | tr -d '\\t'",
        "CapInh:0000000000000000\nCapPrm:0000000000000000\nCapEff:0000000000000000\n"
        "CapAmb:0000000000000000\nNoNewPrivs:1\n");
}

void TestIsolation::insideIsOwn()
{
    QFETCH(Setting, setting);
    QFETCH(QString, script);
    QFETCH(QString, output);
    QFETCH(int, exitCode);
    const Result result = run(setting, {QStringLiteral("--root"), root()}, script);
    QCOMPARE(result.output, output);
    QVERIFY2(result.exitCode == exitCode, qPrintable(result.errors));
}

void TestIsolation::rootKeepsWhatIsWritten()
{
    QFETCH(Setting, setting);
    const QString mark = QFileInfo(m_folder->path()).fileName() + QStringLiteral("-mark");
    const Result result =
        run(setting,
            {QStringLiteral("--root"), root(), QStringLiteral("--setenv"), QStringLiteral("MARK=") + mark},
            QStringLiteral("set -e; for d in /etc/vesk /usr/share/vesk /tmp; do echo kept > $d/$MARK; done; "
                           "echo gone > /etc/hostname"));
    QVERIFY2(result.exitCode == 0, qPrintable(result.errors));
    for (const char *folder : {"/etc/vesk/", "/usr/share/vesk/", "/tmp/"}) {
        QCOMPARE(readFile(root() + QLatin1String(folder) + mark), QStringLiteral("kept\n"));
        QCOMPARE(readFile(QLatin1String(folder) + mark), QStringLiteral("<absent>"));
    }
    QCOMPARE(readFile(root() + QStringLiteral("/etc/hostname")), QStringLiteral("kiosk-7\n"));
    QCOMPARE(QDir(root() + QStringLiteral("/tmp"))
                 .entryList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot),
             QStringList{mark}); // no mount points
}

// A character that TIOCSTI puts into the input of a terminal is typed into the shell that the user returns
// to.
void TestIsolation::terminalIsOutOfReach()
{
    QFETCH(Setting, setting);
    const QStringList command =
        commandLine(setting, {QStringLiteral("--root"), root()},
                    QStringLiteral("test -t 0 && echo shown; : 2>/dev/null </dev/tty || echo not its own; "
                                   "perl -e '$x = q(x); ioctl(STDIN, 0x5412, $x) or print qq(refused\\n)'"));
    QStringList quoted;
    for (QString word : command)
        quoted << QLatin1Char('\'') + word.replace(QLatin1Char('\''), QLatin1String("'\\''")) +
                      QLatin1Char('\'');
    QProcess process;
    prepare(&process);
    process.start(QStringLiteral("script"),
                  {QStringLiteral("-qec"), quoted.join(QLatin1Char(' ')), QStringLiteral("/dev/null")});
    QCOMPARE(finish(&process).output.remove(QLatin1Char('\r')),
             QStringLiteral("shown\nnot its own\nrefused\n"));
}

void TestIsolation::absentFilesAreAbsent()
{
    QFETCH(Setting, setting);
    QFile::remove(root() + QStringLiteral("/etc/hostname"));
    const Result result = run(setting, {QStringLiteral("--root"), root()},
                              QStringLiteral("test ! -e /etc/hostname -a ! -e /etc/hosts && echo absent"));
    QCOMPARE(result.output, QStringLiteral("absent\n"));
}

void TestIsolation::freshRootIsRemoved()
{
    QFETCH(Setting, setting);
    const Result result =
        run(setting, {}, QStringLiteral("echo x > /etc/vesk/x; cat /etc/hostname; cat /etc/vesk/x"));
    QCOMPARE(result.output, QStringLiteral("terminal-01\nx\n"));
    const QDir temporary(m_folder->filePath(QStringLiteral("temporary")));
    QCOMPARE(temporary.entryList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot), QStringList());
}

void TestIsolation::machineIsReadOnly()
{
    QFETCH(Setting, setting);
    const QString writable = m_folder->filePath(QStringLiteral("writable"));
    const QStringList options{
        QStringLiteral("--root"),     root(),
        QStringLiteral("--writable"), writable,
        QStringLiteral("--bind"),     writable + QStringLiteral(":/usr/share/vesk/shown")};
    const Result result = run(setting, options,
                              QStringLiteral("echo in > %1/file; cat /usr/share/vesk/shown/file; "
                                             "for f in / /etc/vesk-x /usr /var/tmp $HOME; do "
                                             "[ -w $f ] && echo $f; done; true")
                                  .arg(writable));
    QCOMPARE(readFile(writable + QStringLiteral("/file")), QStringLiteral("in\n"));
    QVERIFY2(result.output.startsWith(QLatin1String("in\n")), qPrintable(result.output + result.errors));
    if (setting.isReadOnly())
        QCOMPARE(result.output, QStringLiteral("in\n"));
}

void TestIsolation::termReachesTheCommand()
{
    QFETCH(Setting, setting);
    QProcess process;
    prepare(&process);
    const QStringList command = commandLine(
        setting, {QStringLiteral("--root"), root()},
        QStringLiteral("trap 'echo ended in order; exit 5' TERM; echo ready; while :; do sleep 0.05; done"));
    process.start(command.first(), command.mid(1));
    QVERIFY(process.waitForReadyRead(kLimitMs));
    process.terminate();
    const Result result = finish(&process);
    QCOMPARE(result.output, QStringLiteral("ready\nended in order\n"));
    QCOMPARE(result.exitCode, 5);
}

void TestIsolation::nothingOutlivesIt_data()
{
    QTest::addColumn<Setting>("setting");
    QTest::addColumn<bool>("killed");
    for (const Setting &setting : settings()) {
        QTest::addRow("end %s", qPrintable(setting.name)) << setting << false;
        QTest::addRow("kill -9 %s", qPrintable(setting.name)) << setting << true;
    }
}

void TestIsolation::nothingOutlivesIt()
{
    QFETCH(Setting, setting);
    QFETCH(bool, killed);
    const QStringList before = machineFolders();
    // A number of seconds that no other process on this machine waits for.
    const QString seconds = QStringLiteral("7%1").arg(QCoreApplication::applicationPid());
    QProcess process;
    prepare(&process);
    const QStringList options{QStringLiteral("--root"), root(), QStringLiteral("--setenv"),
                              QStringLiteral("LONG=") + seconds};
    const QStringList command =
        commandLine(setting, options, QStringLiteral("setsid sleep $LONG & echo ready; read line"));
    process.start(command.first(), command.mid(1));
    QVERIFY(process.waitForReadyRead(kLimitMs));
    QTRY_VERIFY(!processesWith(markOf(seconds)).isEmpty());
    QCOMPARE(machineFolders(), before); // no mount point is made on the machine, not even for a while
    if (killed)
        process.kill();
    else
        process.write("\n");
    finish(&process);
    QCOMPARE(processesLeftWith(markOf(seconds)), QStringList());
    QCOMPARE(machineFolders(), before);
}

void TestIsolation::refusesNonsense_data()
{
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<QString>("said");
    const auto row = [](const char *name, const char *arguments, const char *said) {
        QTest::newRow(name) << QString::fromUtf8(arguments).split(QLatin1Char(' '))
                            << QString::fromUtf8(said);
    };
    row("no command", "--bwrap", "no command given");
    row("empty command", "--", "no command given");
    row("command without dashes", "ls /", "unknown word ls");
    row("value missing", "--root", "Missing value after '--root'");
    row("source missing", "--bind /nonexistent:/x -- true", "cannot bind /nonexistent");
    row("relative target", "--bind /etc:x -- true", "x is not an absolute path");
    row("no target", "--bind /etc -- true", "there is no \":\" in it");
    row("no variable", "--setenv =x -- true", "there is no \"=\" in it");
    row("root on a file", "--root /dev/null/x -- true", "cannot make /dev/null/x");
}

void TestIsolation::refusesNonsense()
{
    QFETCH(QStringList, arguments);
    QFETCH(QString, said);
    QProcess process;
    prepare(&process);
    process.start(QStringLiteral(VESK_ISOLATE), arguments);
    const Result result = finish(&process);
    QCOMPARE(result.exitCode, 125);
    QVERIFY2(result.errors.startsWith(QLatin1String("vesk-isolate: ")) && result.errors.contains(said),
             qPrintable(result.errors));
}

QTEST_GUILESS_MAIN(TestIsolation)
#include "tst_isolation.moc"
