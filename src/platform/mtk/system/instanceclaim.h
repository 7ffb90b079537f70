// SPDX-License-Identifier: Apache-2.0
#pragma once

class QString;

// The claim of a process on a name within its user session: a kernel lock on a file. It lies in the first of
// $XDG_RUNTIME_DIR, /run/user/UID, /tmp/runtime-NAME (no link) and ~/.cache that belongs to the user, is not
// writable by others and accepts the file; the last two are created when missing.
namespace Mtk::InstanceClaim {

enum class Answer { Granted, Taken, Unavailable };

struct Claim
{
    Answer answer;
    int descriptor = -1; // holds the claim while it is open; valid when granted
};

Claim take(const QString &key);

} // namespace Mtk::InstanceClaim
