// SPDX-License-Identifier: Apache-2.0
#include "pretendedowner.h"

#include <atomic>
#include <map>
#include <mutex>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

std::atomic<bool> switchedOn = false;
std::mutex ownersMutex;
std::map<ino_t, uid_t> owners;

uid_t ownerOf(ino_t file)
{
    const std::lock_guard<std::mutex> lock(ownersMutex);
    const auto found = owners.find(file);
    return found == owners.end() ? PretendedOwner::kUser : found->second;
}

} // namespace

PretendedOwner::PretendedOwner()
{
    switchedOn = true;
}

PretendedOwner::~PretendedOwner()
{
    switchedOn = false;
    const std::lock_guard<std::mutex> lock(ownersMutex);
    owners.clear();
}

void PretendedOwner::giveTo(const std::string &path, uid_t owner)
{
    struct stat facts = {};
    ::lstat(path.c_str(), &facts);
    const std::lock_guard<std::mutex> lock(ownersMutex);
    owners[facts.st_ino] = owner;
}

extern "C" {

__attribute__((visibility("default"))) int fstat(int descriptor, struct stat *facts)
{
    const int result = ::fstatat(descriptor, "", facts, AT_EMPTY_PATH);
    if (result == 0 && switchedOn)
        facts->st_uid = ownerOf(facts->st_ino);
    return result;
}

__attribute__((visibility("default"))) uid_t geteuid()
{
    return switchedOn ? PretendedOwner::kUser : static_cast<uid_t>(::syscall(SYS_geteuid));
}
}
