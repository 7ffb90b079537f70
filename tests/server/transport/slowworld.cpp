// SPDX-License-Identifier: Apache-2.0
#include "slowworld.h"

#include <atomic>
#include <chrono>
#include <cstring>
#include <thread>

#include <dlfcn.h>
#include <netdb.h>
#include <sys/syscall.h>
#include <time.h>
#include <unistd.h>

namespace {

constexpr long kNanoseconds = 1000000000;
std::atomic<int> answers = 0;

bool onlyGoesForward(clockid_t clock)
{
    return clock == CLOCK_MONOTONIC || clock == CLOCK_MONOTONIC_RAW || clock == CLOCK_MONOTONIC_COARSE;
}

} // namespace

int slowworld::lateAnswers()
{
    return answers;
}

extern "C" {

__attribute__((visibility("default"))) int clock_gettime(clockid_t clock, timespec *time)
{
    const long result = ::syscall(SYS_clock_gettime, clock, time);
    if (result == 0 && onlyGoesForward(clock)) {
        const long nanoseconds = time->tv_nsec * slowworld::kHaste;
        time->tv_sec = time->tv_sec * slowworld::kHaste + nanoseconds / kNanoseconds;
        time->tv_nsec = nanoseconds % kNanoseconds;
    }
    return static_cast<int>(result);
}

__attribute__((visibility("default"))) int getaddrinfo(const char *name, const char *service,
                                                       const addrinfo *hints, addrinfo **result)
{
    static const auto real = reinterpret_cast<decltype(&getaddrinfo)>(::dlsym(RTLD_NEXT, "getaddrinfo"));
    if (std::strcmp(name, "unknown.test") == 0)
        return EAI_NONAME;
    if (std::strcmp(name, "hangs.test") != 0)
        return real(name, service, hints, result);
    std::this_thread::sleep_for(std::chrono::milliseconds(slowworld::kResolverDelayMs));
    const int code = real("127.0.0.1", service, hints, result);
    ++answers;
    return code;
}
}
