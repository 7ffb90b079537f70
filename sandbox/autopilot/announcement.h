// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

/// Says on the session bus that somebody reads the screen, as a screen reader does when it starts; toolkits
/// publish their trees only then. Starts the accessibility bus when the session bus knows how to. Gives the
/// address of that bus; throws a Trouble that says which bus is missing.
QString announceReader();

/// The same, and names the bus on the display: what has to be done once before the program starts. Qt 5 reads
/// the address at its start, and when it finds it nowhere but on the session bus it may start to publish
/// before it is connected, and then never does. Only for a display of our own: the mark stays there.
void prepareDesktop();

} // namespace sandbox
