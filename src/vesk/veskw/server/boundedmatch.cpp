// SPDX-License-Identifier: Apache-2.0
#include "boundedmatch.h"

#include <QByteArrayList>
#include <QElapsedTimer>
#include <QFile>
#include <QRegExp>

#include <cerrno>
#include <csignal>
#include <ctime>
#include <new>
#include <type_traits>

#include <fcntl.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

constexpr rlim_t kMaxProcessorSeconds = 1;
constexpr int kMaxStandstillMs = 1500;
constexpr int kMaxSeconds = 30;
constexpr int kSliceMs = 100; // between two looks at the child
// Above what the child starts with. The address sanitizer holds back 256 of them.
constexpr rlim_t kMaxMemoryMiB = 384;

// What a child exits with that has no answer; chosen apart from what sanitizers use.
enum ExitStatus { kOutOfMemory = 40, kNotConfined = 41, kOrphaned = 42 };

// What the child writes into the pipe; small enough for one write to be atomic.
struct Answer
{
    BoundedMatch::Verdict verdict;
    int position;
    int length;
};
static_assert(std::is_trivially_copyable_v<Answer>);

struct MemoryUse
{
    rlim_t addressSpace; // bytes
    rlim_t data;         // bytes
};

BoundedMatch undecided(const QString &failure)
{
    BoundedMatch match;
    match.failure = failure;
    return match;
}

// False if the kernel does not tell.
bool readMemoryUse(MemoryUse &use)
{
    QFile file(QStringLiteral("/proc/self/statm"));
    if (!file.open(QIODevice::ReadOnly))
        return false;
    const QByteArrayList pages = file.readAll().split(' ');
    if (pages.size() < 6)
        return false;
    const auto pageSize = static_cast<rlim_t>(sysconf(_SC_PAGESIZE));
    use.addressSpace = pages.at(0).toULongLong() * pageSize;
    use.data = pages.at(5).toULongLong() * pageSize;
    return true;
}

bool lowerLimit(__rlimit_resource resource, rlim_t soft, rlim_t hard)
{
    rlimit limit{};
    if (getrlimit(resource, &limit) != 0)
        return false;
    limit.rlim_max = qMin(limit.rlim_max, hard);
    limit.rlim_cur = qMin(limit.rlim_max, soft);
    return setrlimit(resource, &limit) == 0;
}

// The sanitizers' allocator takes its memory out of a reservation, which only the limit for data sees; the
// stack counts as address space alone. The soft limit of processor time gives a signal that tells what it
// was.
bool confine(const MemoryUse &use)
{
    const rlim_t memory = kMaxMemoryMiB << 20;
    return lowerLimit(RLIMIT_CPU, kMaxProcessorSeconds, kMaxProcessorSeconds + 1) &&
           lowerLimit(RLIMIT_AS, use.addressSpace + memory, use.addressSpace + memory) &&
           lowerLimit(RLIMIT_DATA, use.data + memory, use.data + memory) && lowerLimit(RLIMIT_CORE, 0, 0) &&
           prctl(PR_SET_DUMPABLE, 0) == 0; // where cores go into a pipe, their limit does not count
}

void setDefaultSignals()
{
    for (int number = 1; number < NSIG; ++number)
        signal(number, SIG_DFL);
    sigset_t none;
    sigemptyset(&none);
    pthread_sigmask(SIG_SETMASK, &none, nullptr);
}

Answer match(const QString &pattern, const QString &text)
{
    const QRegExp expression(pattern, Qt::CaseSensitive, QRegExp::RegExp);
    if (!expression.isValid())
        return {BoundedMatch::Verdict::Invalid, -1, -1};
    const int position = expression.indexIn(text, 0, QRegExp::CaretAtZero);
    if (position == -1)
        return {BoundedMatch::Verdict::NoMatch, -1, -1};
    return {BoundedMatch::Verdict::Match, position, expression.matchedLength()};
}

// In the child, which has this one thread of the program and must run none of its destructors and handlers.
[[noreturn]] void answerAndExit(int answerEnd, pid_t parent, const MemoryUse &use, const QString &pattern,
                                const QString &text)
{
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    if (getppid() != parent)
        _exit(kOrphaned);
    setDefaultSignals();
    if (dup2(answerEnd, STDIN_FILENO) == -1 || !confine(use))
        _exit(kNotConfined);
    closefrom(STDIN_FILENO + 1);
    try {
        const Answer answer = match(pattern, text);
        _exit(write(STDIN_FILENO, &answer, sizeof answer) == sizeof answer ? EXIT_SUCCESS : EXIT_FAILURE);
    } catch (const std::bad_alloc &) {
        _exit(kOutOfMemory);
    }
}

// As fork(); no handler of the program's runs in the child.
pid_t forkWithoutSignals()
{
    sigset_t all;
    sigset_t before;
    sigfillset(&all);
    pthread_sigmask(SIG_SETMASK, &all, &before);
    const pid_t child = fork();
    if (child != 0) {
        const int error = errno;
        pthread_sigmask(SIG_SETMASK, &before, nullptr);
        errno = error;
    }
    return child;
}

// Notices when a child no longer gets on. What it waits for a processor does not count: a machine that is
// busy with other things says nothing about a rule.
class Standstill
{
public:
    explicit Standstill(pid_t child)
        : m_child(child)
    {
        clock_getcpuclockid(child, &m_clock);
    }

    // To be called at intervals of kSliceMs, or longer ones where this process does not get on either.
    bool isTooLong()
    {
        timespec used{};
        clock_gettime(m_clock, &used);
        const bool hasBegun = used.tv_sec != 0 || used.tv_nsec != 0;
        const bool hasMoved = used.tv_sec != m_used.tv_sec || used.tv_nsec != m_used.tv_nsec;
        m_standsStillMs = hasMoved || !hasBegun || isRunnable() ? 0 : m_standsStillMs + kSliceMs;
        m_used = used;
        return m_standsStillMs >= kMaxStandstillMs;
    }

private:
    // The state follows the name, which may have any character in it: "7 (name) R ...".
    bool isRunnable() const
    {
        QFile file(QStringLiteral("/proc/%1/stat").arg(m_child));
        if (!file.open(QIODevice::ReadOnly))
            return false;
        const QByteArray stat = file.readAll();
        return stat.mid(stat.lastIndexOf(')') + 2, 1) == "R";
    }

    pid_t m_child;
    clockid_t m_clock = CLOCK_PROCESS_CPUTIME_ID;
    timespec m_used = {};
    int m_standsStillMs = 0;
};

// Empty once there is something to read from `pipe`, its end included; else why there is no more waiting.
QString waitForAnswer(int pipe, pid_t child)
{
    QElapsedTimer elapsed;
    elapsed.start();
    Standstill standstill(child);
    pollfd entry{pipe, POLLIN, 0};
    long ready = 0;
    while ((ready = TEMP_FAILURE_RETRY(poll(&entry, 1, kSliceMs))) == 0) {
        if (standstill.isTooLong())
            return QStringLiteral("it stood still for %1 ms").arg(kMaxStandstillMs);
        if (elapsed.hasExpired(kMaxSeconds * 1000LL))
            return QStringLiteral("it took more than %1 s").arg(kMaxSeconds);
    }
    return ready == 1 ? QString() : QStringLiteral("no waiting for it: ") + qt_error_string(errno);
}

bool readAnswer(int pipe, Answer &answer)
{
    return TEMP_FAILURE_RETRY(read(pipe, &answer, sizeof answer)) == sizeof answer;
}

// -1 if the status is lost, since this process ignores SIGCHLD.
int waitForEnd(pid_t child)
{
    int status = 0;
    return TEMP_FAILURE_RETRY(waitpid(child, &status, 0)) == child ? status : -1;
}

QString describeEnd(int status)
{
    if (status == -1)
        return QStringLiteral("it ended without an answer");
    if (WIFSIGNALED(status) && WTERMSIG(status) == SIGXCPU)
        return QStringLiteral("it took more than %1 s of processor time").arg(kMaxProcessorSeconds);
    if (WIFSIGNALED(status))
        return QStringLiteral("it ended with signal %1 (%2)")
            .arg(WTERMSIG(status))
            .arg(QString::fromLocal8Bit(sigdescr_np(WTERMSIG(status))));
    switch (WEXITSTATUS(status)) {
    case kOutOfMemory:
        return QStringLiteral("it took more than %1 MiB of memory").arg(kMaxMemoryMiB);
    case kNotConfined:
        return QStringLiteral("the limits could not be set");
    default:
        return QStringLiteral("it ended with status %1").arg(WEXITSTATUS(status));
    }
}

// Takes the answer out of `pipe` and makes sure that the child is gone.
BoundedMatch collect(int pipe, pid_t child)
{
    BoundedMatch match;
    const QString delay = waitForAnswer(pipe, child);
    if (!delay.isEmpty())
        kill(child, SIGKILL); // alive, or its end of the pipe would be closed
    Answer answer{};
    const bool isAnswered = delay.isEmpty() && readAnswer(pipe, answer);
    const int status = waitForEnd(child);
    if (!delay.isEmpty())
        return undecided(delay);
    if (!isAnswered)
        return undecided(describeEnd(status));
    match.verdict = answer.verdict;
    match.position = answer.position;
    match.length = answer.length;
    return match;
}

} // namespace

BoundedMatch matchInChild(const QString &pattern, const QString &text)
{
    MemoryUse use{};
    if (!readMemoryUse(use))
        return undecided(QStringLiteral("/proc/self/statm cannot be read"));
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) != 0)
        return undecided(QStringLiteral("no pipe: ") + qt_error_string(errno));
    const pid_t parent = getpid();
    const pid_t child = forkWithoutSignals();
    if (child == 0)
        answerAndExit(ends[1], parent, use, pattern, text);
    const QString forkFailure =
        child == -1 ? QStringLiteral("no child process: ") + qt_error_string(errno) : QString();
    close(ends[1]);
    BoundedMatch match = child == -1 ? undecided(forkFailure) : collect(ends[0], child);
    close(ends[0]);
    return match;
}
