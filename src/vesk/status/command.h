// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QStringList>

#include <optional>

// What a command prints in the C locale; no value when it cannot be started or does not end in time.
std::optional<QString> outputOf(const QString &program, const QStringList &arguments);
