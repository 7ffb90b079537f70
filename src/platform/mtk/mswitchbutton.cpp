// SPDX-License-Identifier: Apache-2.0
#include "mswitchbutton.h"

#include "style/shapes.h"
#include "style/theme.h"

#include <QEvent>
#include <QPainter>
#include <QVariantAnimation>

namespace Mtk::Widget {

namespace {

QColor trackColor(bool enabled, bool checked, bool hovered)
{
    const Theme &t = theme();
    if (!enabled)
        return checked ? t.accentDisabled : t.switchOffDisabled;
    if (!checked)
        return hovered ? t.textMuted : t.switchOff;
    return hovered ? t.accentHover : t.accent;
}

QSize ringed(const QSize &size)
{
    const int ring = 2 * (theme().focusRing + theme().focusGap);
    return size + QSize(ring, ring);
}

} // namespace

MSwitchButton::MSwitchButton(QWidget *parent)
    : QAbstractButton(parent)
{
    setCheckable(true);
    setFocusPolicy(Qt::StrongFocus);
    setAttribute(Qt::WA_Hover);
    setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
}

MSwitchButton::~MSwitchButton() = default;

QSize MSwitchButton::sizeHint() const
{
    return ringed({theme().switchWidth, theme().switchHeight});
}

void MSwitchButton::checkStateSet()
{
    QAbstractButton::checkStateSet();
    slideKnob();
}

void MSwitchButton::nextCheckState()
{
    QAbstractButton::nextCheckState();
    slideKnob();
}

bool MSwitchButton::event(QEvent *event)
{
    if (event->type() == QEvent::Hide && m_slide)
        m_slide->setCurrentTime(m_slide->duration());
    return QAbstractButton::event(event);
}

void MSwitchButton::slideKnob()
{
    const qreal goal = isChecked() ? 1 : 0;
    if (!isVisible()) {
        m_knob = goal;
        return;
    }
    if (!m_slide) {
        m_slide = new QVariantAnimation(this);
        m_slide->setEasingCurve(QEasingCurve::OutCubic);
        m_slide->setDuration(theme().slideDuration);
        connect(m_slide, &QVariantAnimation::valueChanged, this, [this](const QVariant &value) {
            m_knob = value.toReal();
            update();
        });
    }
    m_slide->stop();
    m_slide->setStartValue(m_knob);
    m_slide->setEndValue(goal);
    m_slide->start();
}

void MSwitchButton::paintEvent(QPaintEvent * /*event*/)
{
    const Theme &t = theme();
    QPainter painter(this);
    QRectF outer(QPointF(), ringed({t.switchWidth, t.switchHeight}));
    outer.moveCenter(QRectF(rect()).center());
    if (hasFocus())
        drawFocusRing(painter, outer, outer.height() / 2);
    const qreal ring = t.focusRing + t.focusGap;
    const QRectF track = outer.adjusted(ring, ring, -ring, -ring);
    fillRounded(painter, track, track.height() / 2, trackColor(isEnabled(), isChecked(), underMouse()));

    const qreal inset = t.switchKnobInset + (isDown() ? 1 : 0);
    const qreal side = track.height() - 2 * inset;
    const qreal travel = track.width() - 2 * inset - side;
    const QRectF knob(track.x() + inset + m_knob * travel, track.y() + inset, side, side);
    fillRounded(painter, knob, side / 2, t.onAccent);
}

} // namespace Mtk::Widget
