// SPDX-License-Identifier: Apache-2.0
#include "targets.h"

namespace fuzz {

namespace {

struct Entry
{
    const char *name; // of its directory below corpus/
    Target target;
};

constexpr Entry kTargets[] = {
    {"server-page", serverPage},     {"account-page", accountPage}, {"alias-rule", aliasRule},
    {"alias-pattern", aliasPattern}, {"join-reply", joinReply},     {"leave-panel", leavePanel},
    {"removal-reply", removalReply}, {"reply-header", replyHeader}, {"request-target", requestTarget},
    {"record-file", recordFile},     {"machine-file", machineFile}, {"host-name-file", hostNameFile},
    {"backup-config", backupConfig}, {"pem-files", pemFiles},       {"staged-files", stagedFiles},
};

} // namespace

Target targetNamed(const QByteArray &name)
{
    for (const Entry &entry : kTargets) {
        if (name == entry.name)
            return entry.target;
    }
    return nullptr;
}

} // namespace fuzz
