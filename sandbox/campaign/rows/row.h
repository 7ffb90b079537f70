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
    QJsonObject end;      // expectation
    QJsonObject stops;    // by message: the call after which a journey ends with it
    QStringList settings; // beginnings of "GROUP/KEY=VALUE", as the journey may write them
    QStringList beside;   // parts of lines that go with a call and are none
    QStringList unheard;  // parts of lines that stand in a call's place: it has not got through
};

// How often each call is made.
struct ExpectedCalls
{
    QMap<QString, int> times; // by name
    int unheard = 0;          // at most so many do not get through
};

// One row of the campaign: a fault at a stage, as the scenario that it makes of the world. What the tables
// leave to be understood is said in the scenario's "expect": all boxes in "messages", all calls in "asked",
// and the next attempt. Placeholders ("{ca}" and the like) are not filled in.
struct Row
{
    QString group;
    QString stage;
    QString fault;
    QString note; // why this row differs from its neighbours; empty for most
    bool isFast = false;
    QJsonObject scenario;

    QString id() const { return group + QLatin1Char('/') + stage + QLatin1Char('/') + fault; }
};

} // namespace sandbox
