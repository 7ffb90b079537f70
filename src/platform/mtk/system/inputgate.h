// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "accessiblecalls.h"
#include "heldkeys.h"

#include <QObject>
#include <QPointer>
#include <QVector>

class QAbstractButton;
class QEvent;
class QWidget;
class QWindow;

namespace Mtk {

// Decides which input of the user reaches the widgets; MApplication has one. Qt keeps mouse and keyboard away
// from a window behind a modal one and from a widget that does not show, but a press by assistive technology
// is no input event and passes it by: the gate keeps that away as well. While the application is busy it
// keeps everything away, and a press that began before is dropped. A key that is held presses once, whatever
// windows open or close meanwhile.
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

    // To be asked for each event before it is delivered, since filters may keep the release of a key from the
    // gate. True for a repeat of Return, Enter, Escape or Space, which must reach nobody; what edits text may
    // repeat, and Space does so in a text field.
    bool isRepeatedPress(const QObject &receiver, const QEvent &event);

    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    void dropPresses();
    bool endPress(QAbstractButton *button, QEvent *timer);
    void forgetReleasedKeys(const QWindow *focus);

    static int s_busySections;
    bool m_isBusy = false;
    AccessibleCalls m_calls; // the way of assistive technology
    HeldKeys m_keys;
    QVector<QPointer<QAbstractButton>> m_dropped; // pressed when the application became busy or ceased to be
};

} // namespace Mtk
