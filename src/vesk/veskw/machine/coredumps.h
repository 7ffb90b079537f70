// SPDX-License-Identifier: Apache-2.0
#pragma once

namespace coredumps {

// No core file is written of this process or of those that it starts, since one of this process would hold
// passwords and the terminal's key.
void disable();

} // namespace coredumps
