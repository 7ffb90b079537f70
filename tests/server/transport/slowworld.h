// SPDX-License-Identifier: Apache-2.0
#pragma once

// In a program that is linked with these functions a wait costs less than it says, for the libraries too, so
// that limits of a minute can be waited for: while time passes, a poll() of a thread other than the main one
// that finds nothing for a moment ends, and every clock that only goes forward is put on by what is left of
// it. The work between two waits takes its real time, on a slow machine too. And these names are resolved
// here: "hangs.test" as long as it does, then it becomes 127.0.0.1; "unknown.test" does not exist.
namespace slowworld {

void letTimePass(bool passes);

// Puts the clocks on, and wakes who waits for a time by them.
void skip(int seconds);

// From now on "hangs.test" is resolved at once, also where it has hung so far.
void resolveAtOnce();

} // namespace slowworld
