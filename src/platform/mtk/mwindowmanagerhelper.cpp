// SPDX-License-Identifier: Apache-2.0
#include "mwindowmanagerhelper.h"

#include "xdesktop.h"

#include <QGuiApplication>

namespace Mtk {
namespace Gui {

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
    return QGuiApplication::platformName().startsWith(QLatin1String("wayland")) ||
           XDesktop::instance().isComposited();
}

} // namespace Gui
} // namespace Mtk
