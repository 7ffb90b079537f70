// SPDX-License-Identifier: Apache-2.0
#include "paintframe.h"

#include "shapes.h"
#include "theme.h"

#include <QFrame>
#include <QPainter>
#include <QStyleOptionFrame>

namespace Mtk {

bool isSeparator(const QStyleOptionFrame &option)
{
    return option.frameShape == QFrame::HLine || option.frameShape == QFrame::VLine;
}

void paintSeparator(QPainter &painter, const QStyleOptionFrame &option)
{
    QRect line = option.rect;
    if (option.frameShape == QFrame::VLine) {
        line.setX(option.rect.x() + (option.rect.width() - 1) / 2);
        line.setWidth(1);
    } else {
        line.setY(option.rect.y() + (option.rect.height() - 1) / 2);
        line.setHeight(1);
    }
    painter.fillRect(line, theme().separator);
}

void paintPopup(QPainter &painter, const QStyleOption &option)
{
    painter.fillRect(option.rect, theme().surface);
    strokeRounded(painter, option.rect, 0, theme().windowBorder, 1);
}

void paintFocus(QPainter &painter, const QStyleOption &option)
{
    strokeRounded(painter, option.rect, theme().controlRadius, theme().accent, theme().focusRing);
}

} // namespace Mtk
