// SPDX-License-Identifier: Apache-2.0
#pragma once

class QPainter;
class QStyle;
class QStyleOptionButton;
class QWidget;

namespace Mtk {

// A push button with its text and icon: flat, filled with the accent where it is the primary action, red
// where it does what cannot be undone.
void paintButton(QPainter &painter, const QStyleOptionButton &option, const QStyle &style,
                 const QWidget *widget);

} // namespace Mtk
