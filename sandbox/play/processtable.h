// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QVector>

#include <sys/types.h>

namespace sandbox {

// A process as /proc shows it at one moment.
struct ProcessEntry
{
    pid_t id = 0;
    pid_t parent = 0;
    QByteArray name; // of its executable, 15 bytes at most
};

// All processes that this one has started, at whatever remove; one that lost its starter is among them as
// long as a process of ours took it over.
QVector<ProcessEntry> descendants();

// Arguments of a process, each closed by a NUL; empty when it has gone.
QByteArray argumentsOf(pid_t process);
// Its environment when it was started, likewise.
QByteArray environmentOf(pid_t process);

// The one descendant of that name that was started last, and that none of that name has forked; 0: there is
// none.
pid_t descendantNamed(const QByteArray &name);

} // namespace sandbox
