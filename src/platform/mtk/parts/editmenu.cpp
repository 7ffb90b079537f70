// SPDX-License-Identifier: Apache-2.0
#include "editmenu.h"

#include <QAction>
#include <QContextMenuEvent>
#include <QLineEdit>
#include <QMenu>

namespace Mtk::Widget {

namespace {

struct Word
{
    const char *qt;
    const char *chinese;
};

constexpr Word kWords[] = {{"&Undo", "撤消"},  {"&Redo", "恢复"},  {"Cu&t", "剪切"},      {"&Copy", "复制"},
                           {"&Paste", "粘贴"}, {"Delete", "删除"}, {"Select All", "全选"}};

QString inChinese(const QString &text)
{
    for (const Word &word : kWords) {
        if (text == QLineEdit::tr(word.qt))
            return QString::fromUtf8(word.chinese);
    }
    return text;
}

void openMenu(QLineEdit &edit, const QPoint &place)
{
    QMenu *menu = edit.createStandardContextMenu();
    menu->setAttribute(Qt::WA_DeleteOnClose);
    const QList<QAction *> actions = menu->actions();
    for (QAction *action : actions) {
        // Behind the tab stands the shortcut.
        QStringList parts = action->text().split(QLatin1Char('\t'));
        parts.first() = inChinese(parts.constFirst());
        action->setText(parts.join(QLatin1Char('\t')));
    }
    menu->popup(place);
}

// The menu key's twin, of which Qt's platform plugins don't know.
bool isMenuShortcut(const QEvent &event)
{
    if (event.type() != QEvent::KeyPress)
        return false;
    const auto &press = static_cast<const QKeyEvent &>(event);
    return press.key() == Qt::Key_F10 && press.modifiers() == Qt::ShiftModifier;
}

} // namespace

bool opensEditMenu(QLineEdit &edit, const QEvent &event)
{
    if (edit.contextMenuPolicy() != Qt::DefaultContextMenu)
        return false;
    const bool isShortcut = isMenuShortcut(event);
    if (isShortcut)
        openMenu(edit, edit.mapToGlobal(edit.inputMethodQuery(Qt::ImCursorRectangle).toRect().center()));
    else if (event.type() == QEvent::ContextMenu)
        openMenu(edit, static_cast<const QContextMenuEvent &>(event).globalPos());
    return isShortcut || event.type() == QEvent::ContextMenu;
}

} // namespace Mtk::Widget
