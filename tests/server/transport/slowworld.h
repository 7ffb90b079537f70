// SPDX-License-Identifier: Apache-2.0
#pragma once

// In a program that is linked with these functions every clock that only goes forward runs ten times as fast,
// for the libraries too, so that limits of a minute can be waited for; sleeping takes its real time. And
// these names are resolved here: "hangs.test" becomes 127.0.0.1 after kResolverDelayMs, "unknown.test" does
// not exist.
namespace slowworld {

constexpr int kHaste = 10;
constexpr int kResolverDelayMs = 5000; // real ones

// How often "hangs.test" has been resolved to the end.
int lateAnswers();

} // namespace slowworld
