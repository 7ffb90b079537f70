// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QPointer>
#include <QVector>

class QAbstractButton;

namespace Mtk {

// Keeps the buttons of all windows from telling a click. Who discards input events has stopped mouse and
// keyboard; a screen reader presses a button by a message that is no input event.
class HeldButtons
{
public:
    void hold();
    void release();

private:
    QVector<QPointer<QAbstractButton>> m_buttons;
};

} // namespace Mtk
