// SPDX-License-Identifier: Apache-2.0
#include "shapes.h"

#include "theme.h"

#include <QPainter>

namespace Mtk {

namespace {

qreal fittingRadius(const QRectF &rect, qreal radius)
{
    return qMax(0.0, qMin(radius, qMin(rect.width(), rect.height()) / 2));
}

} // namespace

void fillRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &fill)
{
    const qreal fitting = fittingRadius(rect, radius);
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(fill);
    painter.drawRoundedRect(rect, fitting, fitting);
    painter.restore();
}

void strokeRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &color, qreal width)
{
    const QRectF middle = rect.adjusted(width / 2, width / 2, -width / 2, -width / 2);
    const qreal fitting = fittingRadius(middle, radius - width / 2);
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(color, width));
    painter.setBrush(Qt::NoBrush);
    painter.drawRoundedRect(middle, fitting, fitting);
    painter.restore();
}

QRectF drawFocusRing(QPainter &painter, const QRectF &rect, qreal radius)
{
    const Theme &t = theme();
    strokeRounded(painter, rect, radius, t.accent, t.focusRing);
    const qreal inset = t.focusRing + t.focusGap;
    return rect.adjusted(inset, inset, -inset, -inset);
}

} // namespace Mtk
