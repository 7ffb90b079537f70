// SPDX-License-Identifier: Apache-2.0
#pragma once

class QPainter;
class QStyleOptionProgressBar;
class QWidget;

namespace Mtk {

// The two layers of a progress bar: what it runs on, and how far it is. With an empty range a part of the
// bar, where the widget's Look::kPhase has brought it.
void paintGroove(QPainter &painter, const QStyleOptionProgressBar &option);
void paintProgress(QPainter &painter, const QStyleOptionProgressBar &option, const QWidget *widget);

} // namespace Mtk
