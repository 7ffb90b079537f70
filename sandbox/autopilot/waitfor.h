// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDeadlineTimer>
#include <QString>
#include <QThread>

#include <stdexcept>

namespace sandbox {

/// Why a walk cannot go on, in one line for the person who started it. Thrown by every part of the autopilot
/// and caught in its main function or in a test; never thrown out of a slot or an event handler.
class Error : public std::runtime_error
{
public:
    explicit Error(const QString &text)
        : std::runtime_error(text.toStdString())
    {
    }

    QString text() const { return QString::fromUtf8(what()); }
};

/// An object of the program did not answer: it is gone, or the program is busy. Whoever waits looks again.
class Vanished : public Error
{
public:
    using Error::Error;
};

constexpr unsigned long kPollInterval = 50; // milliseconds

/// Asks `question` every 50 ms until it yields something that counts as true and hands that back. An object
/// that vanished while the question was asked means: ask again. When the time is over, throws an Error with
/// the text `complaint`.
template <typename Question>
auto waitFor(const QDeadlineTimer &deadline, const QString &complaint, const Question &question)
{
    while (true) {
        try {
            if (auto answer = question())
                return answer;
        } catch (const Vanished &) {
            // A tree that changes while it is read is read again from its top.
        }
        if (deadline.hasExpired())
            throw Error(complaint);
        QThread::msleep(kPollInterval);
    }
}

} // namespace sandbox
