// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QObject>
#include <QPointer>
#include <QVector>

class QAbstractButton;
class QEvent;
class QWidget;

namespace Mtk {

// Decides which input of the user reaches the widgets; MApplication has one. Qt keeps mouse and keyboard away
// from a window behind a modal one and from a widget that does not show, but a press by assistive technology
// is no input event and passes it by: the gate keeps that away as well. While the application is busy it
// keeps everything away, and a press that began before is dropped.
class InputGate : public QObject
{
    Q_OBJECT

public:
    // Serves `application`, which must outlive it.
    explicit InputGate(QObject *application);
    ~InputGate() override;

    void setBusy(bool busy);

    // Whether the user can reach `widget` now: it is visible, no modal window is in front of its window, and
    // the application is not busy. Whether it is enabled is another question.
    static bool isOpen(const QWidget &widget);

    // Counts how often the application became busy: a press that began under another number is dropped.
    static int busySections() { return s_busySections; }

    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    void dropPresses();
    bool endPress(QAbstractButton *button, QEvent *timer);

    static int s_busySections;
    bool m_isBusy = false;
    QVector<QPointer<QAbstractButton>> m_dropped; // pressed when the application became busy or ceased to be
};

} // namespace Mtk
