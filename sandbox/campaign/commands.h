// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// The words of vesk-sandbox that are about rows of the campaign; the first argument is the word. Each returns
// the exit code: 0, 1 on failure, 2 for a usage error, 77 for a row that cannot run here.

int listRows(const QStringList &arguments);   // rows
int showRow(const QStringList &arguments);    // show
int makeWorlds(const QStringList &arguments); // worlds
int runRow(const QStringList &arguments);     // run

} // namespace sandbox
