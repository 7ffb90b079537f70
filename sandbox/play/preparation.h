// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

#include <QJsonObject>
#include <QStringList>

namespace sandbox {

// Does to the files of a world what a scenario says under "prepare", after the world has started and before
// the program does:
//     record      keys laid over the terminal's record; a "domain_port" of "{port}" is that of the enrolment
//     address resolver    "silent": the program's name server, asked for names that are in no table, never
//     answers places      see obstacles.h
// Throws an Error.
void prepareFiles(const StateDirectory &state, const QJsonObject &prepare);

// Before the world starts: writes a scenario to `file`, with what it cannot know filled in as the server
// sends it
//     {ca}                the CA of the world, whose server has been started once
//     {cert} {key}        a new pair for this terminal, by that CA
//     {other_key}         a key that belongs to another certificate
// and lays what it says of the server's configuration over that of a world that has one already. Throws an
// Error.
void writeScenario(const StateDirectory &state, const QJsonObject &scenario, const QString &file);

// How a scenario has its program started.
struct ProgramStart
{
    QStringList isolation; // further options of vesk-isolate
    QStringList command;
};

// What a scenario says under "start":
//     command      what is started in veskw's place: a program that lies beside it, with its arguments, in
//     which "{port}"
//                  is that of the enrolment address
//     umask        octal digits
//     read_only    paths that the program finds on a read-only file system
//     traced       true: the arguments of every process that it starts, and so on, go to
//                  StateDirectory::starts()
// "small_tmp" comes before it; see needs.h.
ProgramStart programStart(const QJsonObject &start, const QString &program, const StateDirectory &state);

} // namespace sandbox
