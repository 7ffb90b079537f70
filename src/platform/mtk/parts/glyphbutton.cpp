// SPDX-License-Identifier: Apache-2.0
#include "glyphbutton.h"

#include "style/shapes.h"
#include "style/theme.h"

#include <QPainter>

namespace Mtk::Widget {

GlyphButton::GlyphButton(Glyph glyph, const QString &name, QWidget *parent)
    : QAbstractButton(parent)
    , m_glyph(glyph)
{
    setAttribute(Qt::WA_Hover);
    setCursor(Qt::ArrowCursor);
    setFocusPolicy(Qt::NoFocus);
    setFixedSize(sizeHint());
    setGlyph(glyph, name);
}

void GlyphButton::setGlyph(Glyph glyph, const QString &name)
{
    m_glyph = glyph;
    setAccessibleName(name);
    setToolTip(name);
    update();
}

void GlyphButton::setDestructive(bool destructive)
{
    m_destructive = destructive;
    update();
}

QSize GlyphButton::sizeHint() const
{
    return {theme().glyphButton, theme().glyphButton};
}

void GlyphButton::paintEvent(QPaintEvent * /*event*/)
{
    const Theme &t = theme();
    QPainter painter(this);
    QColor color = isEnabled() ? t.textMuted : t.textDisabled;
    if (isEnabled() && (isDown() || underMouse())) {
        const QColor red = isDown() ? t.alertPressed : t.alert;
        const QColor plain = isDown() ? t.controlPressed : t.controlHover;
        fillRounded(painter, rect(), t.controlRadius, m_destructive ? red : plain);
        color = m_destructive ? t.onAccent : t.text;
    }
    if (hasFocus())
        strokeRounded(painter, rect(), t.controlRadius, t.accent, t.focusRing);
    QRectF place(0, 0, t.glyph, t.glyph);
    place.moveCenter(QRectF(rect()).center());
    drawGlyph(painter, m_glyph, place, color);
}

} // namespace Mtk::Widget
