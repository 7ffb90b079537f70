// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

// Worlds that rows and people start from. state: directory of the world; a world that is there goes
// first, anything else is refused. Each returns false with one line in `error`.
namespace sandbox::worlds {

// One in which nothing has happened yet; its server has its certificates.
bool makeNew(const QString &state, QString *error);
// One in which the terminal has joined.
bool makeJoined(const QString &state, QString *error);
bool copy(const QString &from, const QString &state, QString *error);

} // namespace sandbox::worlds
