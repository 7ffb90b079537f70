// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "campaign/faultscenario.h"
#include "campaign/row.h"

namespace sandbox {

class StrictObject;

// A stage and a fault as they stand in the file of a group, and how they are read. Used by TablesReader only;
// every function throws JsonTrouble at a slip.

struct TableStage
{
    QString name;
    QString journey;
    QString call;
    QStringList with; // optional calls that the journey makes here
    QString before;   // part of the journal's line after which the stage's call comes next
    FaultPlace place;
    QJsonObject scenario;
    QJsonObject prepare;
    QJsonObject start;
    QStringList needs;
    QVector<Action> actions;
    QJsonObject stop;
    QMap<QString, QJsonObject> outcomes;
};

struct TableFault
{
    QString name;
    QString title;
    QString classOfOutcome;
    QJsonObject does;
    QJsonObject prepare;
    QJsonObject start;
    QStringList needs;
    QVector<Action> actions;
    QJsonObject expect;
    bool isSeen = true; // the service hears of the call
    QStringList only;   // stages; empty: all
    QStringList fast;   // stages whose rows are in the fast part
};

TableStage readStage(StrictObject &object);
TableFault readFault(StrictObject &object);

// What is expected of the fault at the stage, before the ends of a journey and the stage's own are laid
// under.
QJsonObject outcomeOf(const TableStage &stage, const TableFault &fault);
// A word about the boxes takes the place of one of the other form.
QJsonObject outcomeOver(QJsonObject base, const QJsonObject &patch);

QString requiredText(StrictObject &object, const char *key);
// What stands at `key`: one object for each of its keys.
QMap<QString, QJsonObject> objectsIn(StrictObject &top, const char *key);

} // namespace sandbox
