// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

class World;

// What a user does beside the walk, while the program is at work. The functions serve events until it is
// done, and throw an Error when it cannot be.
namespace useractions {

// Presses a button that shows, whatever the program is doing, and waits for nothing.
void press(World &world, const QString &button);

// Starts the program a second time: it says that it runs already and ends normally once that is read.
void startAgain(World &world);

// Whether the program answers a question about itself on the accessibility bus within the time: its event
// loop runs.
bool isAnswering(const World &world, int limitMs);

} // namespace useractions

} // namespace sandbox
