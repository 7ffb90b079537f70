// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QStringList>

// Catches what the code under test logs, so that it can be searched for secrets and slows nothing down.
namespace logbook {

void open();
void clear();
bool contains(const QString &text);

} // namespace logbook
