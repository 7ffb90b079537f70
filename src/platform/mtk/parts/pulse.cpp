// SPDX-License-Identifier: Apache-2.0
#include "pulse.h"

#include "style/theme.h"

#include <QEvent>
#include <QWidget>

namespace Mtk::Widget {

Pulse::Pulse(QWidget *widget)
    : QObject(widget)
    , m_widget(widget)
    , m_shown(widget->isVisible())
{
    widget->installEventFilter(this);
}

void Pulse::setWanted(bool wanted)
{
    m_wanted = wanted;
    update();
}

qreal Pulse::phase() const
{
    if (!m_clock.isValid())
        return 0;
    return qreal(m_clock.elapsed() % theme().turnDuration) / theme().turnDuration;
}

bool Pulse::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::Show || event->type() == QEvent::Hide) {
        // These come for a minimised window too.
        m_shown = event->type() == QEvent::Show;
        update();
    }
    return QObject::eventFilter(watched, event);
}

void Pulse::timerEvent(QTimerEvent * /*event*/)
{
    m_widget->update();
}

void Pulse::update()
{
    const bool run = m_wanted && m_shown;
    if (run == m_timer.isActive())
        return;
    if (!run) {
        m_timer.stop();
        return;
    }
    m_clock.start();
    m_timer.start(theme().frameInterval, this);
}

} // namespace Mtk::Widget
