// SPDX-License-Identifier: Apache-2.0
#pragma once

class QEvent;
class QLineEdit;

namespace Mtk::Widget {

// True when `event`, which `edit` is about to get, asks for its context menu, by mouse, menu key or
// Shift+F10, and has been answered: with Qt's own menu, in Chinese. Other policies than the default are Qt's
// business.
bool opensEditMenu(QLineEdit &edit, const QEvent &event);

} // namespace Mtk::Widget
