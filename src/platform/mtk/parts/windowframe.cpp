// SPDX-License-Identifier: Apache-2.0
#include "windowframe.h"

#include "style/shapes.h"
#include "style/theme.h"
#include "system/xdesktop.h"

#include <QPainter>
#include <QPainterPath>
#include <QWidget>

namespace Mtk::WindowFrame {

namespace {

int radiusOf(const QWidget *window)
{
    const bool fills = window->isMaximized() || window->isFullScreen();
    return window->testAttribute(Qt::WA_TranslucentBackground) && !fills ? theme().windowRadius : 0;
}

} // namespace

void prepare(QWidget *window)
{
    if (XDesktop::instance().isComposited())
        window->setAttribute(Qt::WA_TranslucentBackground);
}

void paint(QWidget *window, const QColor &background)
{
    QPainter painter(window);
    const int radius = radiusOf(window);
    fillRounded(painter, window->rect(), radius, background);
    strokeRounded(painter, window->rect(), radius, theme().windowBorder, 1);
}

QRegion covered(const QWidget *window)
{
    const qreal ratio = window->devicePixelRatioF();
    const QRectF device(QPointF(), QSizeF(window->size()) * ratio);
    const qreal radius = radiusOf(window) * ratio;
    QPainterPath path;
    path.addRoundedRect(device, radius, radius);
    return {path.toFillPolygon().toPolygon()};
}

} // namespace Mtk::WindowFrame
