// SPDX-License-Identifier: Apache-2.0
#include "paintscrollbar.h"

#include "shapes.h"
#include "theme.h"

#include <QPainter>
#include <QStyleOptionSlider>

namespace Mtk {

namespace {

// A part of the bar in pixels along it, so that both orientations share the arithmetic.
struct Stretch
{
    int start;
    int length;
};

QRect onBar(const QStyleOptionSlider &option, Stretch stretch)
{
    const QRect &r = option.rect;
    if (option.orientation == Qt::Horizontal)
        return {r.x() + stretch.start, r.y(), stretch.length, r.height()};
    return {r.x(), r.y() + stretch.start, r.width(), stretch.length};
}

int barLength(const QStyleOptionSlider &option)
{
    return option.orientation == Qt::Horizontal ? option.rect.width() : option.rect.height();
}

Stretch handle(const QStyleOptionSlider &option)
{
    const int bar = barLength(option);
    const qint64 range = qint64(option.maximum) - option.minimum;
    if (range <= 0)
        return {0, bar};
    const qint64 fair = qint64(bar) * option.pageStep / (range + option.pageStep);
    const int length = int(qBound<qint64>(qMin(theme().scrollHandle, bar), fair, bar));
    const int start = QStyle::sliderPositionFromValue(option.minimum, option.maximum, option.sliderPosition,
                                                      bar - length, option.upsideDown);
    return {start, length};
}

} // namespace

void paintScrollBar(QPainter &painter, const QStyleOptionSlider &option)
{
    if (option.maximum <= option.minimum)
        return;
    const Theme &t = theme();
    const bool active = option.state & (QStyle::State_MouseOver | QStyle::State_Sunken);
    const QRectF place = QRectF(onBar(option, handle(option))).adjusted(1, 1, -1, -1);
    fillRounded(painter, place, qMin(place.width(), place.height()) / 2, active ? t.borderHover : t.border);
}

QRect scrollBarPart(const QStyleOptionSlider &option, QStyle::SubControl part)
{
    const Stretch grip = handle(option);
    const int end = grip.start + grip.length;
    switch (part) {
    case QStyle::SC_ScrollBarGroove:
        return option.rect;
    case QStyle::SC_ScrollBarSlider:
        return onBar(option, grip);
    case QStyle::SC_ScrollBarSubPage:
        return onBar(option, {0, grip.start});
    case QStyle::SC_ScrollBarAddPage:
        return onBar(option, {end, barLength(option) - end});
    default:
        return {};
    }
}

} // namespace Mtk
