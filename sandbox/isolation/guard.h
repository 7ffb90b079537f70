// SPDX-License-Identifier: Apache-2.0
#pragma once

namespace sandbox {

// proot neither ends the processes that it traces when it is killed nor those that outlive the command. Two
// processes see to that: the inside stage as long as proot lives, and a guard around proot.

// From now on this process becomes the parent of descendants whose own parent ends.
void adoptOrphans();

// Kills all children of this process, those that it adopts meanwhile included, and returns when none is left.
void endChildren();

// Forks: the caller goes on in the child. The parent stays behind as guard until the child has ended or its
// own parent has died, whichever comes first, ends all that is left and passes the child's exit code on.
void leaveGuardBehind();

} // namespace sandbox
