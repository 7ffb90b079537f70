// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QObject>

namespace Mtk::Gui {

// Tells what the window manager of this session can do. Programs ask it before they choose a translucent or
// an opaque window.
class MTK_EXPORT MWindowManagerHelper : public QObject
{
    Q_OBJECT

public:
    // The one object; needs an application object. Owned by the library.
    static MWindowManagerHelper *instance();

    // Whether what lies behind a translucent window is blurred. Asked again on each call, since window
    // managers switch effects on and off.
    bool hasBlurWindow() const;

    // Whether windows may have translucent parts at all.
    bool hasComposite() const;

private:
    MWindowManagerHelper();
};

} // namespace Mtk::Gui
