// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

/// Whether the X display that DISPLAY names can be reached.
bool canReachDisplay();

/// Writes the address of the accessibility bus to the root window of the display, where a toolkit looks
/// first. Throws a Trouble when the display cannot be reached or refuses.
void nameBusOnDisplay(const QString &address);

} // namespace sandbox
