// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QAbstractButton>

// The button that bears this text, or this name for a screen reader; null when there is none.
inline QAbstractButton *buttonNamed(const QWidget &parent, const QString &name)
{
    for (auto *button : parent.findChildren<QAbstractButton *>()) {
        if (button->text() == name || button->accessibleName() == name)
            return button;
    }
    return nullptr;
}
