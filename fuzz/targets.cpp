// SPDX-License-Identifier: Apache-2.0
#include "targets.h"

#include <algorithm>
#include <array>

namespace fuzz {

namespace {

struct Entry
{
    const char *name; // of its folder below corpus/
    Target target;
};

constexpr std::array<Entry, 15> kTargets = {{
    {"server-page", serverPage},
    {"account-page", accountPage},
    {"alias-rule", aliasRule},
    {"alias-pattern", aliasPattern},
    {"join-reply", joinReply},
    {"leave-panel", leavePanel},
    {"removal-reply", removalReply},
    {"reply-header", replyHeader},
    {"request-target", requestTarget},
    {"record-file", recordFile},
    {"machine-file", machineFile},
    {"host-name-file", hostNameFile},
    {"backup-config", backupConfig},
    {"pem-files", pemFiles},
    {"staged-files", stagedFiles},
}};

} // namespace

Target targetNamed(const QByteArray &name)
{
    const auto *entry = std::find_if(kTargets.begin(), kTargets.end(),
                                     [&](const Entry &candidate) { return name == candidate.name; });
    return entry == kTargets.end() ? nullptr : entry->target;
}

} // namespace fuzz
