// SPDX-License-Identifier: Apache-2.0
#include "messageboxes.h"

#include "require.h"

#include <QApplication>
#include <QEvent>
#include <QPushButton>
#include <QTimer>

namespace fuzz {

MessageBoxes::MessageBoxes()
{
    qApp->installEventFilter(this);
}

bool MessageBoxes::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() != QEvent::Show)
        return false;
    if (auto *dialog = qobject_cast<QDialog *>(watched); dialog != nullptr && dialog->isModal())
        QTimer::singleShot(0, dialog, [this, dialog] { answer(*dialog); });
    return false;
}

void MessageBoxes::answer(QDialog &dialog)
{
    m_texts.append(dialog.accessibleName());
    if (whileOpen)
        whileOpen(dialog);
    QPushButton *last = nullptr;
    const auto buttons = dialog.findChildren<QPushButton *>();
    for (QPushButton *button : buttons)
        last = button->isVisibleTo(&dialog) && !button->text().isEmpty() ? button : last;
    require(last != nullptr, "a dialog has a button");
    last->click();
}

} // namespace fuzz
