// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QStringList>

// Command lines of the running processes that mention `mark`, this test itself left out. Zombies have none.
QStringList processesWith(const QString &mark);

// The same once it is empty, or after some seconds.
QStringList processesLeftWith(const QString &mark);
