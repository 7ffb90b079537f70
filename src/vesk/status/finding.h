// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QCoreApplication>
#include <QJsonValue>
#include <QString>
#include <QVector>

#include <optional>

// What a finding is worth: in order, wrong, not to be told by this user, or nothing to judge.
enum class State { Ok, Fault, Unknown, None };

// One thing that was looked at. Foreign text in it is as it was found; writers make it harmless.
struct Finding
{
    QString key; // stable, as in the manual page
    State state = State::None;
    QJsonValue value; // stable, for programs
    QString text;     // in the user's language
    QString advice;   // what to do; empty: nothing
};

using Findings = QVector<Finding>;

// What follows from the terminal record; no value where it cannot be told.
using Joined = std::optional<bool>;

// Texts of this program in the user's language: Text::tr().
class Text
{
    Q_DECLARE_TR_FUNCTIONS(Text)
};

// Name of a state in JSON, and exit code for all findings of a terminal.
QString nameOf(State state);
int exitCodeFor(Joined joined, const Findings &findings);
