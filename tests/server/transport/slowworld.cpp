// SPDX-License-Identifier: Apache-2.0
#include "slowworld.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <cstring>

#include <dlfcn.h>
#include <netdb.h>
#include <poll.h>
#include <pthread.h>
#include <semaphore.h>
#include <sys/syscall.h>
#include <time.h>
#include <unistd.h>

namespace {

constexpr int kMomentMs = 10;
constexpr long kNanoseconds = 1000000000;

std::atomic<bool> timePasses = false;
std::atomic<long> aheadMs = 0;

// Never destroyed: a thread may wait here to the end of the program.
sem_t *gate()
{
    static sem_t made;
    static const int ready = ::sem_init(&made, 0, 0);
    (void)ready;
    return &made;
}

bool onlyGoesForward(clockid_t clock)
{
    return clock == CLOCK_MONOTONIC || clock == CLOCK_MONOTONIC_RAW || clock == CLOCK_MONOTONIC_COARSE;
}

bool inMainThread()
{
    return ::syscall(SYS_gettid) == ::getpid();
}

int pollOnce(pollfd *descriptors, nfds_t count, int timeoutMs)
{
    return static_cast<int>(::syscall(SYS_poll, descriptors, count, timeoutMs));
}

} // namespace

void slowworld::letTimePass(bool passes)
{
    timePasses = passes;
}

void slowworld::skip(int seconds)
{
    aheadMs += seconds * 1000;
}

void slowworld::resolveAtOnce()
{
    ::sem_post(gate());
}

extern "C" {

__attribute__((visibility("default"))) int clock_gettime(clockid_t clock, timespec *time)
{
    const long result = ::syscall(SYS_clock_gettime, clock, time);
    if (result == 0 && onlyGoesForward(clock)) {
        const long nanoseconds = time->tv_nsec + aheadMs % 1000 * (kNanoseconds / 1000);
        time->tv_sec += aheadMs / 1000 + nanoseconds / kNanoseconds;
        time->tv_nsec = nanoseconds % kNanoseconds;
    }
    return static_cast<int>(result);
}

// In slices, so that a wait notices when the clocks are put on.
__attribute__((visibility("default"))) int pthread_cond_clockwait(pthread_cond_t *condition,
                                                                  pthread_mutex_t *mutex, clockid_t clock,
                                                                  const timespec *until)
{
    static const auto real =
        reinterpret_cast<decltype(&pthread_cond_clockwait)>(::dlsym(RTLD_NEXT, "pthread_cond_clockwait"));
    timespec now = {};
    timespec slice = {};
    ::clock_gettime(clock, &now);
    ::syscall(SYS_clock_gettime, clock, &slice);
    if (now.tv_sec > until->tv_sec || (now.tv_sec == until->tv_sec && now.tv_nsec >= until->tv_nsec))
        return ETIMEDOUT;
    slice.tv_nsec += kMomentMs * (kNanoseconds / 1000);
    slice.tv_sec += slice.tv_nsec / kNanoseconds;
    slice.tv_nsec %= kNanoseconds;
    const int result = real(condition, mutex, clock, &slice);
    return result == ETIMEDOUT ? 0 : result;
}

__attribute__((visibility("default"))) int poll(pollfd *descriptors, nfds_t count, int timeoutMs)
{
    if (!timePasses || timeoutMs <= kMomentMs || inMainThread())
        return pollOnce(descriptors, count, timeoutMs);
    const int ready = pollOnce(descriptors, count, kMomentMs);
    if (ready == 0)
        aheadMs += timeoutMs - kMomentMs;
    return ready;
}

__attribute__((visibility("default"))) int getaddrinfo(const char *name, const char *service,
                                                       const addrinfo *hints, addrinfo **result)
{
    static const auto real = reinterpret_cast<decltype(&getaddrinfo)>(::dlsym(RTLD_NEXT, "getaddrinfo"));
    if (std::strcmp(name, "unknown.test") == 0)
        return EAI_NONAME;
    if (std::strcmp(name, "hangs.test") != 0)
        return real(name, service, hints, result);
    ::sem_wait(gate());
    ::sem_post(gate()); // for the next one
    return real("127.0.0.1", service, hints, result);
}
}
