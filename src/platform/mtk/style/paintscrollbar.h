// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QRect>
#include <QStyle>

class QPainter;
class QStyleOptionSlider;

namespace Mtk {

// A slim scroll bar without arrow buttons: a handle on a clear ground.
void paintScrollBar(QPainter &painter, const QStyleOptionSlider &option);
QRect scrollBarPart(const QStyleOptionSlider &option, QStyle::SubControl part);

} // namespace Mtk
