// SPDX-License-Identifier: Apache-2.0
#include "boundedmatch.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QRegExp>
#include <QRegularExpression>
#include <QTemporaryFile>
#include <QTest>

#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <ctime>
#include <thread>

#include <dlfcn.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

using Verdict = BoundedMatch::Verdict;

namespace {

// `part` written `count` times.
QString times(int count, const char *part)
{
    return QString::fromLatin1(part).repeated(count);
}

QString nested(int depth, const char *opening, const char *closing)
{
    return times(depth, opening) + QLatin1Char('a') + times(depth, closing);
}

// Takes hours and little memory.
QString endless()
{
    return QLatin1Char('(') + times(900, ".?") + QLatin1String(")+c");
}

const QString kAlias(32, QLatin1Char('a'));

// Of the children that have ended, in milliseconds.
qint64 processorTimeOfChildren()
{
    rusage usage{};
    getrusage(RUSAGE_CHILDREN, &usage);
    return (usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) * 1000 +
           (usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1000;
}

constexpr unsigned kMaxBusySeconds = 60; // should nobody end it

// Keeps a processor busy until it goes.
class BusyProcess
{
public:
    BusyProcess()
        : m_child(fork())
    {
        if (m_child == 0)
            alarm(kMaxBusySeconds);
        for (volatile bool forEver = true; m_child == 0 && forEver;) {
        }
    }
    ~BusyProcess()
    {
        if (m_child > 0 && kill(m_child, SIGKILL) == 0)
            waitpid(m_child, nullptr, 0);
    }
    Q_DISABLE_COPY_MOVE(BusyProcess)

private:
    const pid_t m_child;
};

// The process that `parent` has started; waits until there is one.
pid_t childOf(pid_t parent)
{
    while (true) {
        for (const QString &name : QDir(QStringLiteral("/proc")).entryList(QDir::Dirs)) {
            QFile file(QStringLiteral("/proc/%1/stat").arg(name));
            if (name.toInt() == 0 || !file.open(QIODevice::ReadOnly))
                continue;
            const QByteArray stat = file.readAll(); // PID (NAME) STATE PPID ...
            if (stat.mid(stat.lastIndexOf(')') + 4).split(' ').first().toInt() == parent)
                return name.toInt();
        }
    }
}

std::atomic<bool> noFork = false;

} // namespace

// These two stand in for those of the system: a kernel that has no more processes is hard to come by, and a
// signal to more than one of them is never right.
extern "C" {

pid_t fork() noexcept
{
    static const auto real = reinterpret_cast<decltype(&fork)>(dlsym(RTLD_NEXT, "fork"));
    errno = EAGAIN;
    return noFork ? -1 : real();
}

int kill(pid_t process, int signal) noexcept
{
    if (process <= 0)
        qFatal("signal %d to process %d", signal, process);
    return static_cast<int>(syscall(SYS_kill, process, signal));
}
}

// Rules that servers send, and rules that would take the program's stack, memory or time.
class TestBoundedMatch : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void matches_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::newRow("whole") << QStringLiteral("^[A-Za-z0-9._\u4e00-\u9fff-]{1,255}$");
        QTest::newRow("nothing") << QStringLiteral("x*");
        QTest::newRow("chinese") << QStringLiteral("[\u4e00-\u9fff]+");
        QTest::newRow("up to 1024 letters") << QStringLiteral("[a-z]{1,1024}");
        QTest::newRow("nested repetitions") << QStringLiteral("((a*)*)*b");
        QTest::newRow("back reference") << QStringLiteral("(a+)\\1");
        QTest::newRow("unclosed") << QStringLiteral("[a-z");
        QTest::newRow("back reference beyond all") << QStringLiteral("a\\15");
    }

    void matches()
    {
        QFETCH(QString, pattern);
        const QString text = QStringLiteral("ws-042终端.") + kAlias;
        const QRegExp expression(pattern, Qt::CaseSensitive, QRegExp::RegExp);
        const int position = expression.indexIn(text, 0, QRegExp::CaretAtZero);

        const BoundedMatch match = matchInChild(pattern, text);
        QCOMPARE(match.failure, QString());
        const Verdict found = position == -1 ? Verdict::NoMatch : Verdict::Match;
        QCOMPARE(match.verdict, expression.isValid() ? found : Verdict::Invalid);
        QCOMPARE(match.position, position);
        QCOMPARE(match.length, expression.matchedLength());
    }

    void givesUp_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::addColumn<QString>("failure"); // regular expression

        // On a busy machine the time is over before anything else is used up.
        const auto time = QStringLiteral("it took more than (1 s of processor time|30 s)");
        // Out of memory, the address sanitizer ends the process itself.
        const auto memory = QStringLiteral("|it took more than 384 MiB of memory|it ended with status 1");
        const auto crash = QStringLiteral("it ended with signal 11 \\(Segmentation fault\\)");
        QTest::newRow("optional") << endless() << time;
        QTest::newRow("four million letters") << times(4 * 1024 * 1024, "a") << time + memory;
        QTest::newRow("repetitions of repetitions")
            << QStringLiteral("(((a{50}){50}){50}){50}") << time + memory;
        QTest::newRow("deep") << nested(60000, "(", ")") << crash;
        QTest::newRow("a number that overflows") << QStringLiteral("a\\2147483648") << crash;
    }

    void givesUp()
    {
        QFETCH(QString, pattern);
        QFETCH(QString, failure);
        const qint64 before = processorTimeOfChildren();
        const BoundedMatch match = matchInChild(pattern, kAlias);
        QVERIFY(processorTimeOfChildren() - before < 1500);
        QCOMPARE(match.verdict, Verdict::Undecided);
        QVERIFY2(
            QRegularExpression(QRegularExpression::anchoredPattern(failure)).match(match.failure).hasMatch(),
            qPrintable(match.failure));
    }

    // SIGCHLD may have been ignored by whoever started the program.
    void worksWhereChildrenAreIgnored()
    {
        const auto before = signal(SIGCHLD, SIG_IGN);
        const BoundedMatch match = matchInChild(QStringLiteral("a+"), kAlias);
        const BoundedMatch crash = matchInChild(nested(60000, "(", ")"), kAlias);
        signal(SIGCHLD, before);
        QCOMPARE(match.length, kAlias.length());
        QCOMPARE(crash.failure, QStringLiteral("it ended without an answer"));
    }

    // A lock belongs to all processes that have its descriptor; the instance claim is one.
    void childHoldsNoLock()
    {
        QTemporaryFile file;
        QVERIFY(file.open());
        const QByteArray path = QFile::encodeName(file.fileName());
        const int first = open(path.constData(), O_RDONLY | O_CLOEXEC);
        const int second = open(path.constData(), O_RDONLY | O_CLOEXEC);
        QCOMPARE(flock(first, LOCK_EX), 0);
        QCOMPARE(flock(second, LOCK_EX | LOCK_NB), -1);

        std::atomic<bool> ended = false;
        std::thread matching([&] {
            matchInChild(endless(), kAlias);
            ended = true;
        });
        const pid_t child = childOf(getpid());
        close(first);
        while (flock(second, LOCK_EX | LOCK_NB) != 0 && !ended) {
        }
        const bool outlivesTheLock = !ended;
        kill(child, SIGKILL);
        matching.join();
        close(second);
        QVERIFY(outlivesTheLock);
    }

    // Processor time alone would not end it.
    void endsAChildThatStandsStill()
    {
        BoundedMatch match;
        std::thread matching([&] { match = matchInChild(endless(), kAlias); });
        const pid_t child = childOf(getpid());
        clockid_t clock = 0;
        timespec used{};
        QCOMPARE(clock_getcpuclockid(child, &clock), 0);
        while (used.tv_sec == 0 && used.tv_nsec == 0)
            clock_gettime(clock, &used);
        QElapsedTimer elapsed;
        elapsed.start();
        kill(child, SIGSTOP);
        matching.join();
        QCOMPARE(match.failure, QStringLiteral("it stood still for 1500 ms"));
        QVERIFY2(elapsed.elapsed() < 3000, qPrintable(QString::number(elapsed.elapsed())));
    }

    // It needs a quarter of a second, and gets a sixteenth of a processor, as this process does.
    void aBusyMachineRefusesNoGoodRule()
    {
        cpu_set_t one;
        cpu_set_t before;
        CPU_ZERO(&one);
        CPU_SET(0, &one);
        sched_getaffinity(0, sizeof before, &before);
        sched_setaffinity(0, sizeof one, &one);
        const std::array<BusyProcess, 15> others;
        const BoundedMatch match = matchInChild(times(600, ".?"), kAlias);
        sched_setaffinity(0, sizeof before, &before);
        QCOMPARE(match.failure, QString());
        QCOMPARE(match.length, kAlias.length());
    }

    void noChildIsNoRule()
    {
        noFork = true;
        const BoundedMatch match = matchInChild(QStringLiteral("a+"), kAlias);
        noFork = false;
        QCOMPARE(match.verdict, Verdict::Undecided);
        QVERIFY2(match.failure.startsWith(QStringLiteral("no child process: ")), qPrintable(match.failure));
    }

    void childEndsWithItsParent()
    {
        QCOMPARE(prctl(PR_SET_CHILD_SUBREAPER, 1), 0);
        const pid_t parent = fork();
        if (parent == 0) {
            matchInChild(endless(), kAlias);
            _exit(EXIT_SUCCESS);
        }
        const pid_t child = childOf(parent);
        kill(parent, SIGKILL);
        QCOMPARE(waitpid(parent, nullptr, 0), parent);
        int status = 0;
        QCOMPARE(waitpid(child, &status, 0), child);
        QVERIFY(!WIFSIGNALED(status) || WTERMSIG(status) != SIGXCPU); // that would be its own limit
    }
};

QTEST_GUILESS_MAIN(TestBoundedMatch)
#include "tst_boundedmatch.moc"
