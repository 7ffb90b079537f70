// SPDX-License-Identifier: Apache-2.0
#include "heldbuttons.h"

#include <QAbstractButton>
#include <QApplication>

namespace Mtk {

void HeldButtons::hold()
{
    const QWidgetList widgets = QApplication::allWidgets();
    for (QWidget *widget : widgets) {
        auto *button = qobject_cast<QAbstractButton *>(widget);
        if (button != nullptr && !button->blockSignals(true))
            m_buttons.append(button);
    }
}

void HeldButtons::release()
{
    for (const QPointer<QAbstractButton> &button : qAsConst(m_buttons)) {
        if (button)
            button->blockSignals(false);
    }
    m_buttons.clear();
}

} // namespace Mtk
