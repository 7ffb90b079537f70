// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

class QWidget;

namespace Mtk::Widget {

// Adjusts how the theme draws one widget. Never instantiated.
class MTK_EXPORT MStyle
{
public:
    MStyle() = delete;

    // Corner radius of a frame in logical pixels; 0 and less give square corners. Drawing limits it to half
    // of the shorter side. A null `widget` is ignored.
    static void setFrameRadius(QWidget *widget, int radius);
};

} // namespace Mtk::Widget
