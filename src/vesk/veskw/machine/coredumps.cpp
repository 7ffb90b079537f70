// SPDX-License-Identifier: Apache-2.0
#include "coredumps.h"

#include <sys/resource.h>

void coredumps::disable()
{
    const rlimit none = {0, 0};
    setrlimit(RLIMIT_CORE, &none); // lowering a limit is always allowed
}
