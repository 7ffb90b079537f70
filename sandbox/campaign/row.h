// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QMap>
#include <QString>
#include <QStringList>
#include <QVector>

namespace sandbox {

// One call that a journey makes of the world around the program, as it shows in the journal.
struct Call
{
    QString name;
    QString page;            // the page whose button leads to it
    QString line;            // part of the journal's line
    bool isOptional = false; // made only where a row says so
    bool isApart = false;    // started in its turn, and then runs on its own: its line may come later
};

// The way through the program that a row takes, when nothing goes wrong.
struct JourneyPlan
{
    QStringList pages; // in their order
    QVector<Call> calls;
    QJsonObject end;              // expectation
    QMap<QString, QString> stops; // by message: the call after which a journey ends with it
    QStringList settings;         // beginnings of "GROUP/KEY=VALUE", as the journey may write them
    QStringList beside;           // parts of lines that go with a call and are none
    QStringList unheard;          // parts of lines that stand in a call's place: it has not got through
};

// How often each call is made.
struct ExpectedCalls
{
    QMap<QString, int> times; // by name
    int unheard = 0;          // at most so many do not get through
};

// Something done to the world while the program walks, when the journal tells of a moment.
struct Action
{
    QString
        on; // part of a line of the journal; empty: when the program starts; "@ready": when its window shows
    QString what; // one of RowActions::names()
};

// How the attempt after the fault goes, with the fault mended.
struct NextAttempt
{
    enum class How {
        None,  // the row ends before it
        Press, // in the window that stands there
        Start, // in a new start of the program, after the window was closed
        Kill   // in a new start, after the program was killed, since its window does not close
    };
    How how = How::None;
    QString journey;
    QString page;
    QStringList boxes;
    QString files;
};

// How the program ends while it walks.
enum class Ending {
    None, // it lives
    Killed,
    Terminated,
    DisplayLost
};

// What must be seen.
struct Expectation
{
    QString page;
    QStringList boxes;            // to the letter, in their order
    Ending ending = Ending::None; // otherwise page, boxes and the window's close are not looked at
    bool mayClose = true;
    QString files;       // a state of files.json
    QStringList log;     // parts of the program's log
    QStringList journal; // parts of the world's journal
    QJsonObject world;   // see worldholds.h
    ExpectedCalls asked;
    NextAttempt next;
};

// One row of the campaign, complete: a fault at a stage and what must be seen.
struct Row
{
    QString group;
    QString stage;
    QString fault;
    QString title; // of the fault, for people
    QString note;  // why this row differs from its neighbours; empty for most
    QString journey;
    QStringList with;     // optional calls of the journey that are made here
    QJsonObject scenario; // placeholders in it are not filled in
    QJsonObject prepare;  // what is done to the files of the world; see preparation.h and obstacles.h
    QJsonObject start;    // how the program is started; see programstart.h
    QStringList needs;    // see rowneeds.h
    QVector<Action> actions;
    bool isFast = false;
    Expectation expect;

    QString id() const { return group + QLatin1Char('/') + stage + QLatin1Char('/') + fault; }
};

} // namespace sandbox
