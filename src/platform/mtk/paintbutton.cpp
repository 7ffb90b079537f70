// SPDX-License-Identifier: Apache-2.0
#include "paintbutton.h"

#include "msuggestbutton.h"
#include "shapes.h"
#include "theme.h"

#include <QPainter>
#include <QStyle>
#include <QStyleOptionButton>
#include <QVariant>

namespace Mtk {

namespace {

constexpr char kEnding[] = "mtkEndingButton";

struct Look
{
    QColor fill;
    QColor text;
};

struct States
{
    bool enabled;
    bool pressed;
    bool hovered;

    explicit States(QStyle::State state)
        : enabled(state & QStyle::State_Enabled)
        , pressed(state & (QStyle::State_Sunken | QStyle::State_On))
        , hovered(state & QStyle::State_MouseOver)
    {
    }
};

QColor pick(const States &states, const QColor &rest, const QColor &hovered, const QColor &pressed,
            const QColor &disabled)
{
    if (!states.enabled)
        return disabled;
    return states.pressed ? pressed : states.hovered ? hovered : rest;
}

Look suggestedLook(const States &states)
{
    const Theme &t = theme();
    return {pick(states, t.accent, t.accentHover, t.accentPressed, t.accentDisabled), t.onAccent};
}

Look plainLook(const States &states, bool flat)
{
    const Theme &t = theme();
    const QColor rest = flat ? QColor(Qt::transparent) : t.control;
    const QColor disabled = flat ? QColor(Qt::transparent) : t.controlDisabled;
    return {pick(states, rest, t.controlHover, t.controlPressed, disabled),
            states.enabled ? t.text : t.textDisabled};
}

Look lookOf(const QStyleOptionButton &option, const QWidget *widget)
{
    const States states(option.state);
    if (qobject_cast<const Widget::MSuggestButton *>(widget))
        return suggestedLook(states);
    Look look = plainLook(states, option.features & QStyleOptionButton::Flat);
    if (states.enabled && widget && widget->property(kEnding).toBool())
        look.text = states.pressed ? theme().alertPressed : theme().alert;
    return look;
}

QRectF paintedRing(QPainter &painter, const QStyleOptionButton &option)
{
    const QStyle::State focused = QStyle::State_HasFocus | QStyle::State_KeyboardFocusChange;
    if ((option.state & focused) != focused)
        return option.rect;
    return drawFocusRing(painter, option.rect, theme().controlRadius);
}

} // namespace

void paintButton(QPainter &painter, const QStyleOptionButton &option, const QStyle &style,
                 const QWidget *widget)
{
    const Look look = lookOf(option, widget);
    const QRectF body = paintedRing(painter, option);
    const qreal inset = body.x() - option.rect.x();
    fillRounded(painter, body, theme().controlRadius - inset, look.fill);
    QStyleOptionButton label = option;
    label.palette.setColor(QPalette::ButtonText, look.text);
    style.drawControl(QStyle::CE_PushButtonLabel, &label, &painter, widget);
}

void setEndingButton(QWidget *button)
{
    button->setProperty(kEnding, true);
}

} // namespace Mtk
