// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QMetaObject>

namespace Mtk::Gui {

// The theme's colors that programs may choose with MFrame::setBackgroundRole. Never instantiated. The numbers
// are part of the binary interface.
class MTK_EXPORT MPalette
{
    Q_GADGET

public:
    enum ColorType {
        NoType = 0,             // no background of its own
        ItemBackground = 1,     // what a row of a form or a list lies on
        FrameShadowBorder = 10, // what a panel that asks for attention lies on
    };
    Q_ENUM(ColorType)

    MPalette() = delete;
};

} // namespace Mtk::Gui
