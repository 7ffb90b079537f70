// SPDX-License-Identifier: Apache-2.0
#pragma once

// Of the program, as in the manual page.
namespace exitcode {

// The terminal's state, and --report.
constexpr int kSound = 0;
constexpr int kNotJoined = 1;
constexpr int kFault = 2;
constexpr int kCannotTell = 3;
constexpr int kWrongUse = 64;
constexpr int kCannotCreate = 73; // the file of --report, as in sysexits.h

// --check
constexpr int kWouldJoin = 0;
constexpr int kWouldBeRefused = 1;
constexpr int kNotReached = 2;

} // namespace exitcode
