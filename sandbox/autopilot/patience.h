// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "trouble.h"

#include <QDeadlineTimer>
#include <QThread>

namespace sandbox {

constexpr unsigned long kPollInterval = 50; // milliseconds

/// Asks `question` every 50 ms until it yields something that counts as true and hands that back. An object
/// that vanished while the question was asked means: ask again. When the time is over, throws a Trouble with
/// the text that `complaint` gives.
template <typename Question, typename Complaint>
auto waitFor(const QDeadlineTimer &deadline, const Complaint &complaint, const Question &question)
{
    while (true) {
        try {
            if (auto answer = question())
                return answer;
        } catch (const Vanished &) {
            // A tree that changes while it is read is read again from its top.
        }
        if (deadline.hasExpired())
            throw Trouble(complaint());
        QThread::msleep(kPollInterval);
    }
}

} // namespace sandbox
