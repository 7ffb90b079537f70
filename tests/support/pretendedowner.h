// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <string>

#include <sys/types.h>

// Lets files of this process belong to whom a test needs, whoever runs it: the program takes fstat(),
// lstat() and geteuid() from here, in libraries too where its executable exports them. Switched on while an
// object of this class lives.
class PretendedOwner
{
public:
    static constexpr uid_t kUser = 1000; // whom the process pretends to be, if nothing else is said

    explicit PretendedOwner(uid_t user = kUser);
    ~PretendedOwner();
    PretendedOwner(const PretendedOwner &) = delete;
    PretendedOwner &operator=(const PretendedOwner &) = delete;

    // All other files belong to the user.
    static void giveTo(const std::string &path, uid_t owner);
};
