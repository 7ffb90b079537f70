// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

// The regular expression that a server sends for terminal aliases, before anything is made of it.
namespace aliaspattern {

// Whether `pattern` can be compiled and tried in about a second and some tens of megabytes: the expression
// class copies a group for each repetition of it, descends into nested groups by recursion, and tries
// look-aheads within look-aheads at every place. A repetition without its end and a back reference beyond the
// highest make a pattern invalid and are not bearable; a pattern with another mistake may be.
bool isBearable(const QString &pattern);

} // namespace aliaspattern
