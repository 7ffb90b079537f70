// SPDX-License-Identifier: Apache-2.0
#include "syscallfilter.h"

#include <array>
#include <cerrno>
#include <initializer_list>

#include <linux/capability.h>
#include <seccomp.h>
#include <sys/prctl.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace sandbox {

bool dropCapabilities()
{
    // The first invalid number ends the list; without the right to drop capabilities there are none to drop.
    for (unsigned long capability = 0; ::prctl(PR_CAPBSET_DROP, capability, 0, 0, 0) == 0; ++capability) {
    }
    __user_cap_header_struct header = {_LINUX_CAPABILITY_VERSION_3, 0};
    const std::array<__user_cap_data_struct, _LINUX_CAPABILITY_U32S_3> none = {};
    return ::prctl(PR_CAP_AMBIENT, PR_CAP_AMBIENT_CLEAR_ALL, 0, 0, 0) == 0 &&
           ::syscall(SYS_capset, &header, none.data()) == 0 && ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) == 0;
}

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
