// SPDX-License-Identifier: Apache-2.0
#include "paintprogress.h"

#include "pulse.h"
#include "shapes.h"
#include "theme.h"

#include <QPainter>
#include <QPainterPath>
#include <QStyleOptionProgressBar>
#include <QWidget>

namespace Mtk {

namespace {

constexpr qreal kTravellingPart = 0.3; // of the bar's length

QColor barColor(const QStyleOptionProgressBar &option)
{
    return option.state & QStyle::State_Enabled ? theme().accent : theme().accentDisabled;
}

// From and to, each 0 to 1 along the bar.
QPair<qreal, qreal> filledPart(const QStyleOptionProgressBar &option, const QWidget *widget)
{
    const qint64 range = qint64(option.maximum) - option.minimum;
    if (range > 0)
        return {0, qBound(0.0, qreal(qint64(option.progress) - option.minimum) / qreal(range), 1.0)};
    const auto *pulse =
        widget ? widget->findChild<Widget::Pulse *>(QString(), Qt::FindDirectChildrenOnly) : nullptr;
    const qreal start = (pulse ? pulse->phase() : 0) * (1 + kTravellingPart) - kTravellingPart;
    return {qMax(0.0, start), qMin(1.0, start + kTravellingPart)};
}

QRectF along(const QStyleOptionProgressBar &option, QPair<qreal, qreal> part)
{
    const QRectF whole = option.rect;
    const qreal length = part.second - part.first;
    if (option.orientation == Qt::Vertical)
        return {whole.x(), whole.bottom() - part.second * whole.height(), whole.width(),
                length * whole.height()};
    const bool mirrored = (option.direction == Qt::RightToLeft) != option.invertedAppearance;
    const qreal start = mirrored ? 1 - part.second : part.first;
    return {whole.x() + start * whole.width(), whole.y(), length * whole.width(), whole.height()};
}

qreal roundEnds(const QRectF &rect)
{
    return qMin(rect.width(), rect.height()) / 2;
}

} // namespace

void paintGroove(QPainter &painter, const QStyleOptionProgressBar &option)
{
    fillRounded(painter, option.rect, roundEnds(option.rect), theme().track);
}

void paintProgress(QPainter &painter, const QStyleOptionProgressBar &option, const QWidget *widget)
{
    const QRectF filled = along(option, filledPart(option, widget));
    if (filled.isEmpty())
        return;
    QPainterPath groove;
    groove.addRoundedRect(option.rect, roundEnds(option.rect), roundEnds(option.rect));
    QPainterPath part;
    // A short part keeps the groove's round ends by being cut out of it, instead of shrinking to a dot.
    const qreal radius = roundEnds(option.rect);
    part.addRoundedRect(filled.adjusted(filled.left() > option.rect.left() ? 0 : -radius, 0, 0, 0), radius,
                        radius);
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.fillPath(groove & part, barColor(option));
    painter.restore();
}

} // namespace Mtk
