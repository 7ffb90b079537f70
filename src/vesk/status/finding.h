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

    using Words = const QString &;
    static Finding ok(Words key, const QJsonValue &value, Words text, Words advice = {})
    {
        return {key, State::Ok, value, text, advice};
    }
    static Finding fault(Words key, const QJsonValue &value, Words text, Words advice)
    {
        return {key, State::Fault, value, text, advice};
    }
    static Finding none(Words key, const QJsonValue &value, Words text, Words advice = {})
    {
        return {key, State::None, value, text, advice};
    }
    static Finding unknown(Words key, Words text, Words advice = {})
    {
        return {key, State::Unknown, QJsonValue::Null, text, advice};
    }
};

using Findings = QVector<Finding>;

// What follows from the terminal record; no value where it cannot be told.
using Joined = std::optional<bool>;

// Texts of this program in the user's language: Text::tr().
class Text
{
    Q_DECLARE_TR_FUNCTIONS(Text)
};

// For all findings of a terminal.
int exitCodeFor(Joined joined, const Findings &findings);
