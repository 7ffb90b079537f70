// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QString>

namespace sandbox {

// Where in a world the faults of a stage strike; what a stage does not have stays empty.
struct FaultPlace
{
    QString endpoint;    // of the server
    int connection = 0;  // number of the server's connection that carries the stage's request, from 1
    QString service;     // on the bus
    QString operation;   // of the service, where it has several
    QJsonObject granted; // what the server answers when all is well
};

// What a fault ("does" of the tables) means for a scenario at that place:
//     reply       a reply in place of the server's own: "status"; the granted one with "set" and "drop", or
//                 "json", "body", "hex" or "repeat" (text, middle, end; text and end "times") in its place;
//                 "words" are its words for the user where they cannot be told from that
//     endpoint    keys of the scenario's endpoint
//     connection  name of a connection's fault
//     service     keys of the scenario's service, or of the stage's operation
//     world       keys of the whole scenario
// `where` names the row in a JsonTrouble.
QJsonObject faultScenario(const FaultPlace &place, const QJsonObject &does, const QString &where);

// The words for the user in that reply, empty where it has none.
QString wordsOf(const FaultPlace &place, const QJsonObject &does);

} // namespace sandbox
