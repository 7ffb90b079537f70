// SPDX-License-Identifier: Apache-2.0
#include "paintprogress.h"

#include "looks.h"
#include "shapes.h"
#include "theme.h"

#include <QPainter>
#include <QPainterPath>
#include <QStyleOptionProgressBar>
#include <QVariant>
#include <QWidget>

namespace Mtk {

namespace {

constexpr qreal kMovingPart = 0.3; // of the bar's length

// A part shorter than the bar is thick would have no round ends.
qreal minPart(const QStyleOptionProgressBar &option)
{
    const int thickness = qMin(option.rect.width(), option.rect.height());
    return qMin(1.0, qreal(thickness) / qMax(1, qMax(option.rect.width(), option.rect.height())));
}

// From and to, each along the bar, whose length is 1. What lies outside of the bar is cut off.
QPair<qreal, qreal> filledPart(const QStyleOptionProgressBar &option, const QWidget *widget)
{
    const qint64 range = qint64(option.maximum) - option.minimum;
    const qint64 done = qint64(option.progress) - option.minimum;
    if (range > 0)
        return {0, done > 0 ? qBound(minPart(option), qreal(done) / qreal(range), 1.0) : 0};
    const qreal phase = widget ? widget->property(Look::kPhase).toReal() : 0;
    const qreal start = phase * (1 + kMovingPart) - kMovingPart;
    return {start, start + kMovingPart};
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
    const qreal radius = roundEnds(option.rect);
    QPainterPath groove;
    groove.addRoundedRect(option.rect, radius, radius);
    QPainterPath part;
    part.addRoundedRect(filled, radius, radius);
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.fillPath(groove & part,
                     option.state & QStyle::State_Enabled ? theme().accent : theme().accentDisabled);
    painter.restore();
}

} // namespace Mtk
