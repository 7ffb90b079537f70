// SPDX-License-Identifier: Apache-2.0
#include "mstyle.h"

#include "frameradius.h"

#include <QVariant>
#include <QWidget>

namespace Mtk {

namespace {

constexpr char kRadius[] = "mtkFrameRadius";

} // namespace

int frameRadius(const QWidget *widget)
{
    return widget->property(kRadius).toInt();
}

namespace Widget {

void MStyle::setFrameRadius(QWidget *widget, int radius)
{
    if (!widget)
        return;
    widget->setProperty(kRadius, qMax(0, radius));
    widget->update();
}

} // namespace Widget
} // namespace Mtk
