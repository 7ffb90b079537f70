// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/placeholders.h"

#include <QByteArray>
#include <QJsonObject>
#include <QMap>
#include <QStringList>
#include <QVector>

#include <optional>

namespace sandbox {

// One call that a journey makes of the world around the program, as it shows in the journal.
struct Call
{
    QString name;
    QString line;            // who is called, and all that is sent, as the journal has it
    bool isDetached = false; // started in its turn, and then runs on its own: its line may come later
};

// The way through the program that a row takes, when nothing goes wrong.
struct JourneyPlan
{
    QVector<Call> calls;
    QStringList members;    // of D-Bus interfaces, each after the name of its service, that may be called
    QStringList programs;   // that may be started: paths
    QStringList peers;      // that may be connected to: paths of sockets, "ADDRESS:PORT"; both with wildcards
    QStringList ignored;    // parts of lines that go with a call and are none
    QStringList incomplete; // parts of lines that stand in a call's place: it has not got through
};

// How often each call is made.
struct ExpectedCalls
{
    QMap<QString, int> times; // by name
    int incomplete = 0;       // at most this many do not get through
};

// A fault at a stage, as the scenario that it makes of the world; see docs/sandbox.md. Its "expect" is
// complete: all texts of message boxes in "messages", all calls in "calls", and the next attempt.
// Placeholders ("{ca}" and the like) are not filled in.
struct Row
{
    QString id;   // GROUP/STAGE/FAULT
    QString note; // why it differs from its neighbours; empty for most
    bool isFast = false;
    QJsonObject scenario;
};

// The rows of the campaign as make-rows made them of the tables.
class Rows
{
public:
    // Reads a file of make-rows, by default this installation's: "../share/vesk-sandbox/rows.jsonl" beside
    // the directory of the running program. Throws an Error.
    static Rows load(const QString &file = QString());

    QVector<Row> all() const; // by group, stage, fault
    // By its id, by another name that it has, or as a file (*.json) in the form that "show" prints. Throws an
    // Error for a file that is none.
    std::optional<Row> find(const QString &name) const;
    QJsonObject otherNames() const { return part("names"); } // ids by name

    JourneyPlan journey(const QString &name, const Placeholders &values) const;
    // Of a state, by path of ViewFiles: "absent", or mode ("0600", "*" for any), a blank, and what stands
    // there: "directory" and the like, and of a file "empty", "ca", "key", "cert", "record true", "other",
    // "any". What lies elsewhere must be as it was at the start of the row.
    QJsonObject files(const QString &state) const { return part("states").value(state).toObject(); }
    // What "record true" and the like stand for: the text of a record, with placeholders.
    QJsonObject records() const { return part("records"); }
    // What may be there in every state.
    QJsonObject filesOfAll() const { return part("always"); }

private:
    QJsonObject part(const char *name) const { return m_head.value(QLatin1String(name)).toObject(); }

    QJsonObject m_head;
    QList<QByteArray> m_lines; // rows, read when they are asked for: some are large
};

} // namespace sandbox
