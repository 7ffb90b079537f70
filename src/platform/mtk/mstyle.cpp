// SPDX-License-Identifier: Apache-2.0
#include "mstyle.h"

#include "style/looks.h"

#include <QVariant>
#include <QWidget>

namespace Mtk::Widget {

void MStyle::setFrameRadius(QWidget *widget, int radius)
{
    if (!widget)
        return;
    widget->setProperty(Look::kRadius, qMax(0, radius));
    widget->update();
}

} // namespace Mtk::Widget
