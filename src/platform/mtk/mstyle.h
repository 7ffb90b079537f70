// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

class QWidget;

namespace Mtk::Widget {

// Adjusts how the theme draws one widget. Never made as an object; the drawing itself is the library's own.
class MTK_EXPORT MStyle
{
public:
    MStyle() = delete;

    // Corner radius of a frame in logical pixels, 0 for square corners. Drawing limits it to half of the
    // shorter side. `widget` may be null.
    static void setFrameRadius(QWidget *widget, int radius);
};

} // namespace Mtk::Widget
