// SPDX-License-Identifier: Apache-2.0
#include "finding.h"

#include "exitcodes.h"

#include <algorithm>

namespace {

bool has(const Findings &findings, State state)
{
    return std::any_of(findings.begin(), findings.end(),
                       [state](const Finding &finding) { return finding.state == state; });
}

} // namespace

int exitCodeFor(Joined joined, const Findings &findings)
{
    if (!joined)
        return exitcode::kCannotTell;
    if (!*joined)
        return exitcode::kNotJoined;
    if (has(findings, State::Fault))
        return exitcode::kFault;
    return has(findings, State::Unknown) ? exitcode::kCannotTell : exitcode::kSound;
}
