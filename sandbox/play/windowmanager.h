// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QProcessEnvironment>

// Plays the window manager's part on a display that has none, and that one program has for itself.
namespace sandbox::windowmanager {

// Asks every visible window to close, as a press of the button in its frame does, and waits until each has
// read that, or a limit of some seconds where the program does not read. environment: names display and
// cookie; this process takes the cookie over. Returns how many there were.
int askToClose(const QProcessEnvironment &environment);

} // namespace sandbox::windowmanager
