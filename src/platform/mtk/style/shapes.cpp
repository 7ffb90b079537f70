// SPDX-License-Identifier: Apache-2.0
#include "shapes.h"

#include "theme.h"

#include <QPainter>

#include <cmath>

namespace Mtk {

namespace {

void drawRounded(QPainter &painter, const QRectF &rect, qreal radius, const QPen &pen, const QBrush &brush)
{
    const qreal fitting = qMax(0.0, qMin(radius, qMin(rect.width(), rect.height()) / 2));
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(pen);
    painter.setBrush(brush);
    painter.drawRoundedRect(rect, fitting, fitting);
    painter.restore();
}

// With its edges between two device pixels, where smoothing does not blur them.
QRectF onPixels(const QPainter &painter, const QRectF &rect)
{
    const QTransform &toDevice = painter.deviceTransform();
    return toDevice.inverted().mapRect(QRectF(toDevice.mapRect(rect).toRect()));
}

// As many whole device pixels as fit, at least one.
qreal onPixels(const QPainter &painter, qreal width)
{
    const qreal scale = painter.deviceTransform().m11();
    return qMax(1.0, std::floor(width * scale)) / scale;
}

} // namespace

void fillRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &fill)
{
    drawRounded(painter, onPixels(painter, rect), radius, Qt::NoPen, fill);
}

void strokeRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &color, qreal width)
{
    const qreal line = onPixels(painter, width);
    const qreal half = line / 2;
    drawRounded(painter, onPixels(painter, rect).adjusted(half, half, -half, -half), radius - half,
                QPen(color, line), Qt::NoBrush);
}

QRectF drawFocusRing(QPainter &painter, const QRectF &rect, qreal radius)
{
    const Theme &t = theme();
    strokeRounded(painter, rect, radius, t.accent, t.focusRing);
    const qreal inset = t.focusRing + t.focusGap;
    return rect.adjusted(inset, inset, -inset, -inset);
}

} // namespace Mtk
