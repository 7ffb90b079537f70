// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "finding.h"

// Findings for people: state, key and text of each on one line, and below it what to do.
QString toText(const Findings &findings);

// Findings for programs, as the manual page documents it; what a terminal would obey is escaped.
QByteArray toJson(const Findings &findings, int exitCode);
