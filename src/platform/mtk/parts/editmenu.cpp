// SPDX-License-Identifier: Apache-2.0
#include "editmenu.h"

#include <QAction>
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

} // namespace

QMenu *editMenu(QLineEdit *edit)
{
    QMenu *menu = edit->createStandardContextMenu();
    menu->setAttribute(Qt::WA_DeleteOnClose);
    const QList<QAction *> actions = menu->actions();
    for (QAction *action : actions) {
        // Behind the tab stands the shortcut.
        QStringList parts = action->text().split(QLatin1Char('\t'));
        parts.first() = inChinese(parts.constFirst());
        action->setText(parts.join(QLatin1Char('\t')));
    }
    return menu;
}

} // namespace Mtk::Widget
