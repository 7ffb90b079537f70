// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

/// Says on the session bus that somebody reads the screen, as a screen reader does when it starts; toolkits
/// publish their trees only then. Starts the accessibility bus when the session bus knows how to. Gives the
/// address of that bus; throws a Trouble that says which bus is missing.
///
/// To be done before a Qt 5 program starts, on a display that keeps its marks (`Xvfb -noreset`): the launcher
/// of the bus writes the address to the root window. A program that finds it nowhere but on the session bus
/// may publish before it is connected, and then never does.
QString announceReader();

} // namespace sandbox
