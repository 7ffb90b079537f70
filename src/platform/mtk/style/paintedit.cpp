// SPDX-License-Identifier: Apache-2.0
#include "paintedit.h"

#include "looks.h"
#include "shapes.h"
#include "theme.h"

#include <QStyle>
#include <QStyleOptionFrame>
#include <QVariant>
#include <QWidget>

namespace Mtk {

namespace {

QColor borderOf(QStyle::State state, bool alert)
{
    const Theme &t = theme();
    if (!(state & QStyle::State_Enabled))
        return t.borderDisabled;
    if (alert)
        return t.alert;
    if (state & QStyle::State_HasFocus)
        return t.accent;
    return state & QStyle::State_MouseOver ? t.borderHover : t.border;
}

QColor fillOf(QStyle::State state, bool alert)
{
    const Theme &t = theme();
    if (!(state & QStyle::State_Enabled))
        return t.controlDisabled;
    return alert ? t.alertSurface : t.surface;
}

} // namespace

void paintEdit(QPainter &painter, const QStyleOptionFrame &option, const QWidget *widget)
{
    if (option.lineWidth <= 0)
        return;
    const Theme &t = theme();
    const bool alert = widget && widget->property(Look::kAlert).toBool();
    const bool focused = (option.state & QStyle::State_Enabled) && (option.state & QStyle::State_HasFocus);
    fillRounded(painter, option.rect, t.controlRadius, fillOf(option.state, alert));
    strokeRounded(painter, option.rect, t.controlRadius, borderOf(option.state, alert),
                  focused ? t.focusRing : 1);
}

} // namespace Mtk
