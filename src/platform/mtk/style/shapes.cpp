// SPDX-License-Identifier: Apache-2.0
#include "shapes.h"

#include "theme.h"

#include <QPainter>

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

} // namespace

void fillRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &fill)
{
    drawRounded(painter, rect, radius, Qt::NoPen, fill);
}

void strokeRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &color, qreal width)
{
    const qreal half = width / 2;
    drawRounded(painter, rect.adjusted(half, half, -half, -half), radius - half, QPen(color, width),
                Qt::NoBrush);
}

QRectF drawFocusRing(QPainter &painter, const QRectF &rect, qreal radius)
{
    const Theme &t = theme();
    strokeRounded(painter, rect, radius, t.accent, t.focusRing);
    const qreal inset = t.focusRing + t.focusGap;
    return rect.adjusted(inset, inset, -inset, -inset);
}

} // namespace Mtk
