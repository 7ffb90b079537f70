// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QBasicTimer>
#include <QElapsedTimer>
#include <QObject>

class QWidget;

namespace Mtk::Widget {

// The clock of an animated widget, and its child. Runs while it is wanted and the widget is visible, and
// repaints the widget for each frame; otherwise there is no timer.
class Pulse : public QObject
{
    Q_OBJECT

public:
    explicit Pulse(QWidget *widget);

    void setWanted(bool wanted);
    bool isRunning() const { return m_timer.isActive(); }
    // 0 to 1 over Theme::turnDuration, then from 0 again.
    qreal phase() const;

    bool eventFilter(QObject *watched, QEvent *event) override;

protected:
    void timerEvent(QTimerEvent *event) override;

private:
    void update();

    QWidget *m_widget;
    QBasicTimer m_timer;
    QElapsedTimer m_clock;
    bool m_wanted = false;
    bool m_shown;
};

} // namespace Mtk::Widget
