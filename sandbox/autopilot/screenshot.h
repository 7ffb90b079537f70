// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QRect>
#include <QString>

#include <functional>

namespace sandbox {

/// Where the program has a window now, and what of the screen to take with it, in the program's own pixels.
struct Shot
{
    QRect window; ///< empty when it is gone
    QRect whole;  ///< the window, or more
};

/// Takes a screenshot of a window on the display, as a PNG file in a directory that is made if need be.
///
/// Waits up to a second for the screenshot to stand still, since a window may be half painted. Once the
/// window is gone, the last screenshot counts. Throws an Error when the display has no window there, at
/// whatever scale factor, cannot be reached, or the file cannot be written.
void saveScreenshot(const QString &directory, const QString &name, const std::function<Shot()> &shot);

} // namespace sandbox
