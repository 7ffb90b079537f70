// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QRect>
#include <QString>

#include <functional>

namespace sandbox {

/// Takes a screenshot of a part of the screen, as a PNG file in a directory that is made if need be. Needs a
/// QGuiApplication on the display of the program, started with the same scale factor.
///
/// Waits up to a second for the screenshot to stand still, since a window may be half painted. `place` says
/// where to look now, and gives an empty rectangle when the thing is gone: then the last screenshot counts.
/// Throws an Error when the file cannot be written.
void saveScreenshot(const QString &directory, const QString &name, const std::function<QRect()> &place);

} // namespace sandbox
