// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/error.h"

#include <QDeadlineTimer>
#include <QThread>

namespace sandbox {

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
