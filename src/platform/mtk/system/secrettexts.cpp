// SPDX-License-Identifier: Apache-2.0
#include "secrettexts.h"

#include <QAccessible>
#include <QLineEdit>

namespace Mtk {

namespace {

bool isSecret(const QLineEdit &edit)
{
    return edit.echoMode() != QLineEdit::Normal || edit.inputMethodHints().testFlag(Qt::ImhSensitiveData);
}

QString bullets(const QString &text)
{
    return QString(text.size(), QChar(0x2022));
}

bool isOfText(const QAccessibleEvent &event)
{
    return event.type() == QAccessible::TextInserted || event.type() == QAccessible::TextRemoved ||
           event.type() == QAccessible::TextUpdated;
}

void filter(QAccessibleEvent *event);

// Without a handler Qt tells the listeners itself.
void tell(QAccessibleEvent *event)
{
    QAccessible::installUpdateHandler(nullptr);
    QAccessible::updateAccessibility(event);
    QAccessible::installUpdateHandler(filter);
}

template <typename Event>
void tellAt(Event &&bulleted, int cursorPosition)
{
    bulleted.setCursorPosition(cursorPosition);
    tell(&bulleted);
}

void tellBullets(QLineEdit *edit, const QAccessibleEvent &event)
{
    const int cursor = static_cast<const QAccessibleTextCursorEvent &>(event).cursorPosition();
    if (event.type() == QAccessible::TextInserted) {
        const auto &insertion = static_cast<const QAccessibleTextInsertEvent &>(event);
        tellAt(
            QAccessibleTextInsertEvent(edit, insertion.changePosition(), bullets(insertion.textInserted())),
            cursor);
    } else if (event.type() == QAccessible::TextRemoved) {
        const auto &removal = static_cast<const QAccessibleTextRemoveEvent &>(event);
        tellAt(QAccessibleTextRemoveEvent(edit, removal.changePosition(), bullets(removal.textRemoved())),
               cursor);
    } else {
        const auto &update = static_cast<const QAccessibleTextUpdateEvent &>(event);
        tellAt(QAccessibleTextUpdateEvent(edit, update.changePosition(), bullets(update.textRemoved()),
                                          bullets(update.textInserted())),
               cursor);
    }
}

void filter(QAccessibleEvent *event)
{
    auto *edit = isOfText(*event) ? qobject_cast<QLineEdit *>(event->object()) : nullptr;
    if (edit == nullptr || (edit->isVisible() && !isSecret(*edit)))
        tell(event);
    else if (edit->isVisible())
        tellBullets(edit, *event);
}

} // namespace

void SecretTexts::installFilter()
{
    QAccessible::installUpdateHandler(filter);
}

void SecretTexts::removeFilter()
{
    QAccessible::installUpdateHandler(nullptr);
}

} // namespace Mtk
