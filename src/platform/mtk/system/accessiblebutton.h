// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

class QAccessibleInterface;
class QObject;

namespace Mtk {

// For QAccessible::installFactory(): what assistive technology sees of a button and does with it. Differs
// from Qt's own in that a press passes the InputGate, takes effect at once like a mouse's, and never before
// the technology has its answer; and that a button which the user cannot reach now counts as disabled.
// Null for other objects, and for tool buttons, whose menus Qt presents.
QAccessibleInterface *accessibleButton(const QString &className, QObject *object);

} // namespace Mtk
