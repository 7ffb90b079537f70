// SPDX-License-Identifier: Apache-2.0
#pragma once

class QPainter;
class QStyleOptionFrame;
class QWidget;

namespace Mtk {

// The frame of a line edit: a thin border, a ring in the accent color while it has the focus, red in alert.
// `widget` is the QLineEdit or the MLineEdit around one.
void paintEdit(QPainter &painter, const QStyleOptionFrame &option, const QWidget *widget);

} // namespace Mtk
