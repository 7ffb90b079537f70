// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QRect>
#include <QString>

#include <functional>

namespace sandbox {

/// Takes a screenshot of a window on the display, as a PNG file in a directory that is made if need be.
///
/// Waits up to a second for the screenshot to stand still, since a window may be half painted. `place` says
/// where the program has the window now, in its own pixels, and gives an empty rectangle when it is gone:
/// then the last screenshot counts. Throws an Error when the display has no window there, at whatever scale
/// factor, cannot be reached, or the file cannot be written.
void saveScreenshot(const QString &directory, const QString &name, const std::function<QRect()> &place);

} // namespace sandbox
