// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "journal/journal.h"

namespace sandbox {

// How a world keeps a call waiting until something else has happened, whatever process serves the call: each
// held call takes one byte out of a pipe beside the journal, and each release puts one in. A release that
// comes before its call lets that one pass.
class Hold
{
public:
    explicit Hold(const Journal &journal);
    ~Hold(); // the pipe goes, if this object made it
    Q_DISABLE_COPY_MOVE(Hold)

    // The side that releases: makes a new pipe. False with errno set.
    bool create();
    void release() const;

    // The side that waits. open() gives a descriptor that the caller reads one byte from and closes, or -1
    // where no pipe is; the wait blocks the calling thread, and lasts no time where no pipe is.
    int open() const;
    void wait() const;

private:
    QString m_path;
    int m_pipe = -1;
};

// What services and commands do before a call is carried out: the wait that the scenario wants, told in the
// journal. `call` is how the line begins.
void waitAsScripted(const Journal &journal, const QString &source, const QString &call, int delayMs,
                    bool isHeld);

} // namespace sandbox
