// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "scenario/scenario.h"

namespace sandbox {

class StrictObject;

// Turns the text of a scenario file into a Scenario; used by Scenario::load only. Throws JsonTrouble.
class ScenarioReader
{
public:
    static Scenario read(const QString &name, const QByteArray &text);

private:
    static void readServer(Scenario &scenario, StrictObject &server);
    static void readFiles(Scenario &scenario, StrictObject &top);
    static ScenarioInput readInput(StrictObject &input);
    static ScenarioExpectation readExpectation(StrictObject &expectation);
};

} // namespace sandbox
