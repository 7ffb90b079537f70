// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

#include <vector>

// What the observer in the measured program tells, as it happens. Times are nanoseconds of CLOCK_MONOTONIC,
// in both processes the same clock.
struct TraceEvent
{
    enum class Kind { Paint, Connect, Send, Receive };
    qint64 time = 0;
    Kind kind = Kind::Paint;
};

class Trace
{
public:
    // Makes a FIFO at `path` and reads from it.
    explicit Trace(const QString &path);
    ~Trace();
    Trace(const Trace &) = delete;
    Trace &operator=(const Trace &) = delete;

    static qint64 now();

    // The events since the last call, once `wanted` holds for them and nothing has come for `quietMs` more;
    // empty after `limitMs`.
    template <typename Wanted>
    std::vector<TraceEvent> collect(Wanted wanted, int quietMs, int limitMs)
    {
        std::vector<TraceEvent> events;
        const qint64 end = now() + limitMs * 1000000LL;
        while (now() < end) {
            const bool complete = wanted(events);
            if (!readMore(events, complete ? quietMs : 100) && complete)
                return events;
        }
        return {};
    }

private:
    bool readMore(std::vector<TraceEvent> &events, int waitMs);

    int m_descriptor;
    QByteArray m_rest;
};
