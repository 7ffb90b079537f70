// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace vesk::base {

// Foreign text (a reply, a file's content, a path, what a user typed) as it may enter a log line: on one
// line, in the order in which it is read, and of bounded length. Line ends and tabs become blanks; other
// control characters, bidirectional marks and surrogates without a partner become U+FFFD; what is longer than
// kMaxLogText code units is cut, which an ellipsis tells.
constexpr int kMaxLogText = 16 * 1024;
QString logText(const QString &text);

// What logText() takes out: controls, line ends, bidirectional marks.
bool isControl(uint character);

} // namespace vesk::base
