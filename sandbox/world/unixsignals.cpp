// SPDX-License-Identifier: Apache-2.0
#include "unixsignals.h"

#include <QSocketNotifier>

#include <csignal>

#include <fcntl.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kSignals[] = {SIGTERM, SIGINT, SIGHUP};

int g_pipe[2] = {-1, -1};

void remember(int number)
{
    const auto byte = static_cast<unsigned char>(number);
    // Nothing can be done about a full pipe, which holds enough signals anyway.
    [[maybe_unused]] const ssize_t written = ::write(g_pipe[1], &byte, 1);
}

} // namespace

UnixSignals::UnixSignals()
{
    if (::pipe2(g_pipe, O_CLOEXEC | O_NONBLOCK) != 0)
        qFatal("no pipe for signals");
    auto *notifier = new QSocketNotifier(g_pipe[0], QSocketNotifier::Read, this);
    connect(notifier, &QSocketNotifier::activated, this, [this] {
        unsigned char number = 0;
        if (::read(g_pipe[0], &number, 1) == 1)
            Q_EMIT received(number);
    });
    for (const int number : kSignals)
        ::signal(number, remember);
}

UnixSignals::~UnixSignals()
{
    for (const int number : kSignals)
        ::signal(number, SIG_DFL);
    ::close(g_pipe[0]);
    ::close(g_pipe[1]);
}

} // namespace sandbox
