// SPDX-License-Identifier: Apache-2.0
#include "glyph.h"

#include <QPainter>
#include <QPainterPath>

namespace Mtk {

namespace {

// Glyphs are described on a square of this side, whose half pixels are where one pixel wide lines are sharp.
constexpr qreal kSide = 14;
constexpr qreal kLineWidth = 1.25;

QPainterPath lines(std::initializer_list<QLineF> list)
{
    QPainterPath path;
    for (const QLineF &line : list) {
        path.moveTo(line.p1());
        path.lineTo(line.p2());
    }
    return path;
}

QPainterPath cross(qreal from, qreal to)
{
    return lines({{from, from, to, to}, {from, to, to, from}});
}

QPainterPath square(qreal left, qreal top, qreal side)
{
    QPainterPath path;
    path.addRect(QRectF(left, top, side, side));
    return path;
}

QPainterPath restore()
{
    QPainterPath path = square(2.5, 4.5, 7);
    path.addPolygon(QPolygonF({{4.5, 2.5}, {11.5, 2.5}, {11.5, 9.5}}));
    return path;
}

QPainterPath eye()
{
    QPainterPath path;
    path.moveTo(0.8, 7);
    path.cubicTo(3.6, 1.9, 10.4, 1.9, 13.2, 7);
    path.cubicTo(10.4, 12.1, 3.6, 12.1, 0.8, 7);
    path.addEllipse(QPointF(7, 7), 2.1, 2.1);
    return path;
}

QPainterPath maskedEye()
{
    QPainterPath path = eye();
    path.addPath(lines({{2.3, 12.2, 11.7, 1.8}}));
    return path;
}

QPainterPath pathOf(Glyph glyph)
{
    switch (glyph) {
    case Glyph::Menu:
        return lines({{2, 3.5, 12, 3.5}, {2, 7, 12, 7}, {2, 10.5, 12, 10.5}});
    case Glyph::Minimise:
        return lines({{2.5, 7.5, 11.5, 7.5}});
    case Glyph::Maximise:
        return square(2.5, 2.5, 9);
    case Glyph::Restore:
        return restore();
    case Glyph::Close:
        return cross(2.5, 11.5);
    case Glyph::Clear:
        return cross(4.7, 9.3);
    case Glyph::Reveal:
        return eye();
    case Glyph::Mask:
        return maskedEye();
    }
    return {};
}

} // namespace

void drawGlyph(QPainter &painter, Glyph glyph, const QRectF &rect, const QColor &color)
{
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.translate(rect.topLeft());
    painter.scale(rect.width() / kSide, rect.height() / kSide);
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(color, kLineWidth, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    if (glyph == Glyph::Clear)
        painter.drawEllipse(QPointF(kSide / 2, kSide / 2), 5.6, 5.6);
    painter.drawPath(pathOf(glyph));
    painter.restore();
}

} // namespace Mtk
