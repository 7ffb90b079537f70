// SPDX-License-Identifier: Apache-2.0
#pragma once

class QPainter;
class QStyleOption;
class QStyleOptionFrame;

namespace Mtk {

// A frame of shape HLine or VLine.
bool isSeparator(const QStyleOptionFrame &option);
// One thin line in the middle of the rectangle, whatever its width.
void paintSeparator(QPainter &painter, const QStyleOptionFrame &option);

// The panel of a menu or a tool tip.
void paintPopup(QPainter &painter, const QStyleOption &option);

// The ring around whatever has the keyboard's focus and no drawing of its own for it.
void paintFocus(QPainter &painter, const QStyleOption &option);

} // namespace Mtk
