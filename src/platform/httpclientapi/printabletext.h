// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

// Foreign text for a log line: characters that would start another line, steer a terminal or turn the
// direction of writing (control and format characters, line and paragraph separators) become U+FFFD.
QString printable(QString text);
