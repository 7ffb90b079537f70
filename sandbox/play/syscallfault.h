// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"
#include "world/child.h"

#include <QJsonObject>

#include <sys/types.h>

namespace sandbox {

// One call into the kernel that fails in the program, as a scenario says under "syscall". strace makes it
// fail; it counts the calls of each thread, from the moment when it joins in. A signal to more than one
// process is not let out; it counts as a complaint.
class SyscallFault
{
public:
    // fault: as the schema has it; empty: nothing fails.
    SyscallFault(StateDirectory state, QJsonObject fault);

    // Part of the journal's line with which it begins; empty: it is there from the program's start on, or
    // never.
    QString moment() const;
    // What starts the program so that it is there from the start on; `command` itself, where it comes later.
    QStringList startOf(const QStringList &command) const;
    // Joins a program that runs, with all its threads; throws an Error when that is not
    // possible.
    void attach(pid_t program);
    // Lets go of the program.
    void detach();

    // Whether it has struck, and what was seen that must not be.
    QStringList complaints() const;

private:
    QStringList options() const;

    StateDirectory m_state;
    QJsonObject m_fault;
    Child m_strace;
};

} // namespace sandbox
