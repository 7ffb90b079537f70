// SPDX-License-Identifier: Apache-2.0
#include "messageicon.h"

#include "theme.h"

#include <QIconEngine>
#include <QPainter>
#include <QPainterPath>

namespace Mtk {

namespace {

constexpr qreal kSide = 40; // of the square on which the icons are described
const QPointF kMiddle(kSide / 2, kSide / 2);

QPainterPath triangle()
{
    QPainterPath path;
    path.moveTo(20, 6.5);
    path.lineTo(36, 33.5);
    path.lineTo(4, 33.5);
    path.closeSubpath();
    return path;
}

QPainterPath stroke(const QPointF &from, const QPointF &to)
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
        QPixmap picture(size);
        picture.fill(Qt::transparent);
        QPainter painter(&picture);
        paint(&painter, QRect(QPoint(), size), mode, state);
        return picture;
    }

    void paint(QPainter *painter, const QRect &rect, QIcon::Mode /*mode*/, QIcon::State /*state*/) override
    {
        const qreal side = qMin(rect.width(), rect.height());
        painter->save();
        painter->setRenderHint(QPainter::Antialiasing);
        painter->translate(QRectF(rect).center() - QPointF(side, side) / 2);
        painter->scale(side / kSide, side / kSide);
        paintGround(*painter);
        paintSign(*painter);
        painter->restore();
    }

private:
    void paintGround(QPainter &painter) const
    {
        const Theme &t = theme();
        if (m_icon == QStyle::SP_MessageBoxWarning) {
            painter.setBrush(t.caution);
            painter.setPen(QPen(t.caution, 5, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
            painter.drawPath(triangle());
            return;
        }
        painter.setPen(Qt::NoPen);
        painter.setBrush(m_icon == QStyle::SP_MessageBoxCritical ? t.alert : t.accent);
        painter.drawEllipse(kMiddle, 17, 17);
    }

    void paintSign(QPainter &painter) const
    {
        painter.setPen(QPen(theme().onAccent, 3.4, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
        painter.setBrush(Qt::NoBrush);
        switch (m_icon) {
        case QStyle::SP_MessageBoxCritical:
            painter.drawPath(stroke({14.5, 14.5}, {25.5, 25.5}));
            painter.drawPath(stroke({25.5, 14.5}, {14.5, 25.5}));
            break;
        case QStyle::SP_MessageBoxInformation:
            painter.drawPath(stroke({20, 18.5}, {20, 28}));
            painter.drawPoint(QPointF(20, 12.5));
            break;
        case QStyle::SP_MessageBoxQuestion:
            painter.drawPath(questionMark());
            painter.drawPoint(QPointF(20, 28.6));
            break;
        default:
            painter.drawPath(stroke({20, 16}, {20, 23}));
            painter.drawPoint(QPointF(20, 29.2));
        }
    }

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
