// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>

namespace sandbox {

// What a fault of the tables, with its key "does", makes of the world at a stage: part of a scenario.
QJsonObject faultScenario(const QJsonObject &stage, const QJsonObject &does);

// What the server says to the user in such a reply.
QString wordsOf(const QJsonObject &stage, const QJsonObject &does);

} // namespace sandbox
