// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QRectF>

class QColor;
class QPainter;

namespace Mtk {

// The few signs that buttons of the toolkit carry, drawn as lines so that they are sharp at any scale.
enum class Glyph { Menu, Minimise, Maximise, Restore, Close, Clear, Reveal, Mask };

void drawGlyph(QPainter &painter, Glyph glyph, const QRectF &rect, const QColor &color);

} // namespace Mtk
