// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

class QAccessibleInterface;
class QObject;

namespace Mtk {

// For QAccessible::installFactory(): how assistive technology sees and presses a button. Unlike with Qt's
// own, a press has to pass the InputGate, takes effect like a click of the mouse, but not before the
// technology has its reply, and a button that the user cannot reach counts as disabled. A frame around other
// widgets is nothing of its own, where Qt's would be taken for a window. Null for other objects, and for tool
// buttons, whose menus Qt presents.
QAccessibleInterface *accessibleButton(const QString &className, QObject *object);

} // namespace Mtk
