// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QColor>
#include <QRectF>

class QPainter;

namespace Mtk {

// Rounded shapes that widgets and style paint with. Borders lie inside `rect`, so that nothing is cut at a
// widget's edge and lines fall on whole pixels at any scale.
void fillRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &fill);
void strokeRounded(QPainter &painter, const QRectF &rect, qreal radius, const QColor &color, qreal width);

// The ring of a control that has the keyboard's focus. Returns what is left inside for the control itself.
QRectF drawFocusRing(QPainter &painter, const QRectF &rect, qreal radius);

} // namespace Mtk
