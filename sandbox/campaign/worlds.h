// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

// Worlds that rows and people start from: "join", in which nothing has happened yet but that its server has
// certificates, and "leave", in which the terminal has joined and the user has turned the login switches on
// again. state: directory of the world. Failures throw an Error.
namespace sandbox::worlds {

// Which of the two a journey begins in.
QString nameFor(const QString &journey);
// A world that is there goes first; anything else is refused.
void make(const QString &name, const QString &state);
void copy(const QString &from, const QString &state);

} // namespace sandbox::worlds
