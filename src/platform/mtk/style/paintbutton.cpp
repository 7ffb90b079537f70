// SPDX-License-Identifier: Apache-2.0
#include "paintbutton.h"

#include "looks.h"
#include "shapes.h"
#include "theme.h"

#include <QPainter>
#include <QStyle>
#include <QStyleOptionButton>
#include <QVariant>
#include <QWidget>

namespace Mtk {

namespace {

struct Colors
{
    QColor fill;
    QColor text;
};

QColor pick(QStyle::State state, const QColor &rest, const QColor &hovered, const QColor &pressed,
            const QColor &disabled)
{
    if (!(state & QStyle::State_Enabled))
        return disabled;
    if (state & (QStyle::State_Sunken | QStyle::State_On))
        return pressed;
    return state & QStyle::State_MouseOver ? hovered : rest;
}

bool is(const QWidget *widget, const char *look)
{
    return widget && widget->property(look).toBool();
}

Colors colorsOf(const QStyleOptionButton &option, const QWidget *widget)
{
    const Theme &t = theme();
    const QStyle::State state = option.state;
    if (is(widget, Look::kSuggested))
        return {pick(state, t.accent, t.accentHover, t.accentPressed, t.accentDisabled), t.onAccent};
    const bool flat = option.features & QStyleOptionButton::Flat;
    const QColor rest = flat ? QColor(Qt::transparent) : t.control;
    const QColor disabled = flat ? QColor(Qt::transparent) : t.controlDisabled;
    const bool destructive = is(widget, Look::kDestructive);
    const QColor text = destructive ? t.alert : t.text;
    return {pick(state, rest, t.controlHover, t.controlPressed, disabled),
            pick(state, text, text, destructive ? t.alertPressed : t.text, t.textDisabled)};
}

QRectF paintedRing(QPainter &painter, const QStyleOptionButton &option)
{
    if (!(option.state & QStyle::State_HasFocus))
        return option.rect;
    return drawFocusRing(painter, option.rect, theme().controlRadius);
}

} // namespace

void paintButton(QPainter &painter, const QStyleOptionButton &option, const QStyle &style,
                 const QWidget *widget)
{
    const Colors colors = colorsOf(option, widget);
    const QRectF body = paintedRing(painter, option);
    const qreal inset = body.x() - option.rect.x();
    fillRounded(painter, body, theme().controlRadius - inset, colors.fill);
    QStyleOptionButton label = option;
    label.palette.setColor(QPalette::ButtonText, colors.text);
    style.drawControl(QStyle::CE_PushButtonLabel, &label, &painter, widget);
}

} // namespace Mtk
