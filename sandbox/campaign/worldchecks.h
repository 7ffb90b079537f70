// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/campaigntables.h"
#include "world/statefolder.h"

namespace sandbox {

// Compares what a world shows with what a row expects. Each function returns one line for each difference,
// "expected ..., seen ...".
namespace worldchecks {

// How often each call of the journey stands in this part of the journal.
QStringList calls(const JourneyPlan &plan, const QMap<QString, int> &expected, const QByteArray &journal);

// Exactly these files lie in /tmp/vesk and /etc/vesk, with these modes and contents. A content is "record
// false", "record true" (is_Domain), "ca", "certificate", "key", "empty" or "any".
QStringList files(const StateFolder &state, const QMap<QString, QString> &expected);

QStringList journal(const QByteArray &journal, const QStringList &expected);
QStringList log(const StateFolder &state, const QStringList &expected);

} // namespace worldchecks

} // namespace sandbox
