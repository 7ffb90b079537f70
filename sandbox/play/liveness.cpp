// SPDX-License-Identifier: Apache-2.0
#include "play/liveness.h"

#include "autopilot/accessiblebus.h"
#include "autopilot/waitfor.h"

namespace sandbox {

bool isAnswering(const QString &busAddress, const QString &program, int limitMs)
{
    try {
        return !AccessibleBus(busAddress, limitMs).programs(program).isEmpty();
    } catch (const Error &) {
        return false;
    }
}

} // namespace sandbox
