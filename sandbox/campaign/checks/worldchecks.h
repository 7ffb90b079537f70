// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/rows.h"
#include "play/viewfiles.h"
#include "state/statedirectory.h"

// Compares what a world shows with what a row expects. Each function returns one line for each difference.
namespace sandbox::worldchecks {

// Every line of server, buses and commands in this part of the journal belongs to a call of the plan, each
// call is there as often as expected, and they come in their order.
QStringList calls(const JourneyPlan &plan, const ExpectedCalls &expected, const QByteArray &journal);

// The view is as it was before, but for what the state says, which must be so, and what `rows` allow always.
// A record must be one of the attempts so far, a key or certificate one that a reply in the journal has
// brought.
QStringList files(const StateDirectory &state, const ViewFiles &before, const Rows &rows,
                  const QString &expected, const QVector<Placeholders> &attempts);

// The desktop's settings of the user, one "GROUP/KEY=VALUE" each.
QStringList settingsOf(const StateDirectory &state);
// The expected ones are there, and all others are as before.
QStringList settings(const StateDirectory &state, const QStringList &before, const QStringList &expected);

// Each of the texts stands somewhere in the file. what: its name in a complaint.
QStringList texts(const char *what, const QString &path, const QStringList &expected);

// Whether the server has done its work on each request: it has answered, or holds the answer.
bool isIdle(const QByteArray &journal);

// What a world holds beside the terminal's files:
//     known      the server counts the terminal among its own
//     identity   the identity service lets domain accounts log in
//     services   the user's services are to be started
// each true or false.
QStringList world(const StateDirectory &state, const QJsonObject &expected);

// What strace has recorded: only programs of the plan were started, and only its peers connected to.
QStringList trace(const QString &record, const JourneyPlan &plan);

// The autopilot has come to this page after these message boxes, and no further. Two pages on which no
// walk comes to rest do not count: the dialog of the panel, and the progress, which may be too short for it
// and stands for the page before it.
QStringList walk(const QString &page, const QStringList &messages, const QByteArray &journal);

} // namespace sandbox::worldchecks
