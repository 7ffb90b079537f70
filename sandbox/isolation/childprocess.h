// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

#include <functional>

#include <sys/types.h>

namespace sandbox {

// Forks. The child ends with this process, and with the exit code that `work` gives there. -1 when there is
// no child.
pid_t startChild(const std::function<int()> &work);

// Runs a command in a session of its own, without the caller's terminal but for the descriptors it inherits,
// and passes TERM, INT, HUP and QUIT on to its process group. The tools between here and the isolated command
// ignore these signals, so that only the command decides what they do. Returns its exit code, 128 + signal
// when a signal ended it. beforeExec: called in the child; false ends it with 126.
int runForwardingSignals(const QStringList &command, const std::function<bool()> &beforeExec);

// Sets TERM, INT, HUP and QUIT back to what they do in a fresh process.
void restoreSignals();

// Replaces this process. Returns only on failure, with the exit code for it, after one line on standard
// error.
int becomeCommand(const QStringList &command);

// Waits until `child` has ended.
int waitForExitCode(pid_t child);

} // namespace sandbox
