// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QColor>
#include <QRegion>

class QEvent;
class QWidget;

// The frame that windows of the toolkit draw for themselves: main windows and dialogs share it.
namespace Mtk::WindowFrame {

// Makes room for rounded corners where the desktop composites windows. Call before the window is first shown.
void prepare(QWidget *window);

// Background and border. Corners are round where the window has translucent parts and doesn't fill the
// screen.
void paint(QWidget *window, const QColor &background);

// Darkens `window` while a modal one blocks it, so that this stands out. Call with each of its events.
void shadeWhileBlocked(QWidget *window, const QEvent &event);

// What the frame covers, in device pixels.
QRegion covered(const QWidget *window);

} // namespace Mtk::WindowFrame
