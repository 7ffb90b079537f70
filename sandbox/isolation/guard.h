// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <functional>

#include <sys/types.h>

namespace sandbox {

// Some tools do not end the processes that they started when they are killed themselves: proot, the launcher
// of the accessibility bus. A guard around such a tool does.

// From now on this process becomes the parent of descendants whose own parent ends.
void adoptOrphans();

// Kills all children of this process, those that it adopts meanwhile included, and returns when none is left.
void endChildren();

// Forks: the caller goes on in the child. The parent stays behind as guard until the child has ended or its
// own parent has died, whichever comes first, ends all that is left and passes the child's exit code on.
// atEnd: called in the guard before it ends itself, with the id that the child had.
void leaveGuardBehind(const std::function<void(pid_t child)> &atEnd = {});

} // namespace sandbox
