// SPDX-License-Identifier: Apache-2.0
#include "trace.h"

#include <QFile>
#include <QList>

#include <ctime>

#include <fcntl.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

TraceEvent::Kind kindOf(const QByteArray &word)
{
    if (word == "connect")
        return TraceEvent::Kind::Connect;
    if (word == "send")
        return TraceEvent::Kind::Send;
    return word == "receive" ? TraceEvent::Kind::Receive : TraceEvent::Kind::Paint;
}

} // namespace

Trace::Trace(const QString &path)
{
    const QByteArray name = QFile::encodeName(path);
    unlink(name.constData());
    mkfifo(name.constData(), S_IRUSR | S_IWUSR);
    // For writing too, so that it never ends when no program has it open.
    m_descriptor = open(name.constData(), O_RDWR | O_NONBLOCK | O_CLOEXEC);
}

Trace::~Trace()
{
    close(m_descriptor);
}

qint64 Trace::now()
{
    timespec time = {};
    clock_gettime(CLOCK_MONOTONIC, &time);
    return time.tv_sec * 1000000000LL + time.tv_nsec;
}

bool Trace::readMore(std::vector<TraceEvent> &events, int waitMs)
{
    pollfd watched = {m_descriptor, POLLIN, 0};
    if (poll(&watched, 1, waitMs) <= 0)
        return false;
    char buffer[4096];
    const ssize_t length = read(m_descriptor, buffer, sizeof buffer);
    if (length <= 0)
        return false;
    m_rest.append(buffer, static_cast<int>(length));
    QList<QByteArray> lines = m_rest.split('\n');
    m_rest = lines.takeLast();
    for (const QByteArray &line : qAsConst(lines)) {
        const QList<QByteArray> words = line.split(' ');
        if (words.size() == 2)
            events.push_back({words.at(0).toLongLong(), kindOf(words.at(1))});
    }
    return !lines.isEmpty();
}
