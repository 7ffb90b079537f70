// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <cstdio>
#include <cstdlib>

namespace fuzz {

// Ends the process as a crash would when `holds` is false, so that the fuzzer keeps the input.
inline void require(bool holds, const char *invariant)
{
    if (holds)
        return;
    std::fprintf(stderr, "INVARIANT BROKEN: %s\n", invariant);
    std::abort();
}

} // namespace fuzz
