// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/rows.h"
#include "play/viewfiles.h"
#include "state/statefolder.h"

namespace sandbox {

// Compares what a world shows with what a row expects. Each function returns one line for each difference.
namespace worldchecks {

// Every line of server, buses and commands in this part of the journal belongs to a call of the plan, each
// call is there as often as expected, and they come in their order.
QStringList calls(const JourneyPlan &plan, const ExpectedCalls &expected, const QByteArray &journal);

// The view is as it was before, but for what the state says, which must be so, and what `rows` allow
// always.
QStringList files(const StateFolder &state, const ViewFiles &before, const Rows &rows,
                  const QString &expected);

// The desktop's settings of the user, one "GROUP/KEY=VALUE" each.
QStringList settingsOf(const StateFolder &state);
// Only such settings have another value than before that the journey writes.
QStringList settings(const StateFolder &state, const QStringList &before, const JourneyPlan &plan);

QStringList journal(const QByteArray &journal, const QStringList &expected);
QStringList log(const StateFolder &state, const QStringList &expected);

} // namespace worldchecks

} // namespace sandbox
