// SPDX-License-Identifier: Apache-2.0
#include "syscallfilter.h"

#include <cerrno>
#include <initializer_list>

#include <seccomp.h>

namespace sandbox {

bool withholdUntranslatedCalls()
{
    const scmp_filter_ctx filter = seccomp_init(SCMP_ACT_ALLOW);
    if (!filter)
        return false;
    // proot cancels a call by giving it an invalid number, which must not count as another architecture's.
    bool good = seccomp_attr_set(filter, SCMP_FLTATR_ACT_BADARCH, SCMP_ACT_ALLOW) == 0;
    for (const int call :
         {SCMP_SYS(statx), SCMP_SYS(renameat2), SCMP_SYS(faccessat2), SCMP_SYS(openat2), SCMP_SYS(execveat)})
        good = good && seccomp_rule_add(filter, SCMP_ACT_ERRNO(ENOSYS), call, 0) == 0;
    good = good && seccomp_load(filter) == 0;
    seccomp_release(filter);
    return good;
}

} // namespace sandbox
