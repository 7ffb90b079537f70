// SPDX-License-Identifier: Apache-2.0
#include "mwindowmanagerhelper.h"

#include "system/xdesktop.h"

namespace Mtk::Gui {

MWindowManagerHelper::MWindowManagerHelper() = default;

MWindowManagerHelper *MWindowManagerHelper::instance()
{
    static MWindowManagerHelper helper;
    return &helper;
}

bool MWindowManagerHelper::hasBlurWindow() const
{
    return XDesktop::instance().offersBlur();
}

bool MWindowManagerHelper::hasComposite() const
{
    return XDesktop::instance().isComposited();
}

} // namespace Mtk::Gui
