// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace Mtk {

// The claim of a process on a name within its user session: a kernel lock on a file in the session's runtime
// folder.
namespace InstanceClaim {

enum class Answer { Granted, Taken, Unavailable };

struct Claim
{
    Answer answer;
    int descriptor = -1; // holds the claim while it is open; valid when granted
    QString trouble;     // why, when unavailable
};

Claim take(const QString &key);

} // namespace InstanceClaim
} // namespace Mtk
