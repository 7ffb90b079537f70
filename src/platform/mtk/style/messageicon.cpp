// SPDX-License-Identifier: Apache-2.0
#include "messageicon.h"

#include "theme.h"

#include <QIconEngine>
#include <QPainter>
#include <QPainterPath>
#include <QVector>

namespace Mtk {

namespace {

constexpr qreal kSide = 40; // of the square on which the icons are described

// White on the ground: lines and dots.
struct Sign
{
    QVector<QPainterPath> lines;
    QPolygonF dots;
};

QPainterPath line(const QPointF &from, const QPointF &to)
{
    QPainterPath path(from);
    path.lineTo(to);
    return path;
}

QPainterPath questionMark()
{
    QPainterPath path(QPointF(15.5, 16));
    path.cubicTo(15.5, 10.5, 24.8, 10.5, 24.8, 16);
    path.cubicTo(24.8, 19.2, 20, 19.6, 20, 23.2);
    return path;
}

Sign signOf(QStyle::StandardPixmap icon)
{
    switch (icon) {
    case QStyle::SP_MessageBoxCritical:
        return {{line({14.5, 14.5}, {25.5, 25.5}), line({25.5, 14.5}, {14.5, 25.5})}, {}};
    case QStyle::SP_MessageBoxInformation:
        return {{line({20, 18.5}, {20, 28})}, QPolygonF({{20, 12.5}})};
    case QStyle::SP_MessageBoxQuestion:
        return {{questionMark()}, QPolygonF({{20, 28.6}})};
    default:
        return {{line({20, 16}, {20, 23})}, QPolygonF({{20, 29.2}})};
    }
}

QPen roundPen(const QColor &color, qreal width)
{
    return {color, width, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin};
}

// A triangle with round corners, or a disc.
void paintGround(QPainter &painter, QStyle::StandardPixmap icon)
{
    const Theme &t = theme();
    if (icon == QStyle::SP_MessageBoxWarning) {
        painter.setBrush(t.caution);
        painter.setPen(roundPen(t.caution, 5));
        painter.drawPolygon(QPolygonF({{20, 6.5}, {36, 33.5}, {4, 33.5}}));
        return;
    }
    painter.setPen(Qt::NoPen);
    painter.setBrush(icon == QStyle::SP_MessageBoxCritical ? t.alert : t.accent);
    painter.drawEllipse(QPointF(kSide / 2, kSide / 2), 17, 17);
}

class MessageIconEngine : public QIconEngine
{
public:
    explicit MessageIconEngine(QStyle::StandardPixmap icon)
        : m_icon(icon)
    {
    }

    QIconEngine *clone() const override { return new MessageIconEngine(m_icon); }

    QPixmap pixmap(const QSize &size, QIcon::Mode mode, QIcon::State state) override
    {
        QPixmap pixmap(size);
        pixmap.fill(Qt::transparent);
        QPainter painter(&pixmap);
        paint(&painter, QRect(QPoint(), size), mode, state);
        return pixmap;
    }

    void paint(QPainter *painter, const QRect &rect, QIcon::Mode /*mode*/, QIcon::State /*state*/) override
    {
        const qreal side = qMin(rect.width(), rect.height());
        const Sign sign = signOf(m_icon);
        painter->save();
        painter->setRenderHint(QPainter::Antialiasing);
        painter->translate(QRectF(rect).center() - QPointF(side, side) / 2);
        painter->scale(side / kSide, side / kSide);
        paintGround(*painter, m_icon);
        painter->setBrush(Qt::NoBrush);
        painter->setPen(roundPen(theme().onAccent, 3.4));
        for (const QPainterPath &line : sign.lines)
            painter->drawPath(line);
        painter->drawPoints(sign.dots);
        painter->restore();
    }

private:
    QStyle::StandardPixmap m_icon;
};

} // namespace

bool isMessageIcon(QStyle::StandardPixmap icon)
{
    return icon == QStyle::SP_MessageBoxWarning || icon == QStyle::SP_MessageBoxCritical ||
           icon == QStyle::SP_MessageBoxInformation || icon == QStyle::SP_MessageBoxQuestion;
}

QIcon messageIcon(QStyle::StandardPixmap icon)
{
    return QIcon(new MessageIconEngine(icon));
}

} // namespace Mtk
