// SPDX-License-Identifier: Apache-2.0
#include "inputguard.h"

#include <QCoreApplication>
#include <QEvent>
#include <QVariant>

#include <algorithm>
#include <iterator>

namespace {

constexpr char kBusyProperty[] = "busy";

constexpr QEvent::Type kInput[] = {
    QEvent::MouseButtonPress,
    QEvent::MouseButtonRelease,
    QEvent::MouseButtonDblClick,
    QEvent::MouseMove,
    QEvent::NonClientAreaMouseButtonPress,
    QEvent::NonClientAreaMouseButtonRelease,
    QEvent::NonClientAreaMouseButtonDblClick,
    QEvent::NonClientAreaMouseMove,
    QEvent::Wheel,
    QEvent::KeyPress,
    QEvent::KeyRelease,
    QEvent::Shortcut,
    QEvent::ShortcutOverride,
    QEvent::InputMethod,
    QEvent::ContextMenu,
    QEvent::TouchBegin,
    QEvent::TouchUpdate,
    QEvent::TouchEnd,
    QEvent::TouchCancel,
    QEvent::TabletPress,
    QEvent::TabletMove,
    QEvent::TabletRelease,
    QEvent::NativeGesture,
    QEvent::Gesture,
    QEvent::GestureOverride,
    QEvent::DragEnter,
    QEvent::DragMove,
    QEvent::DragLeave,
    QEvent::Drop,
};

} // namespace

InputGuard::InputGuard()
    : m_busyBefore(QCoreApplication::instance()->property(kBusyProperty).toBool())
{
    QCoreApplication::instance()->installEventFilter(this);
    QCoreApplication::instance()->setProperty(kBusyProperty, true);
}

InputGuard::~InputGuard()
{
    QCoreApplication::instance()->removeEventFilter(this);
    // Once for each true: the property may count, and then a section around this one is still busy.
    QCoreApplication::instance()->setProperty(kBusyProperty, false);
    if (m_busyBefore && !QCoreApplication::instance()->property(kBusyProperty).toBool())
        QCoreApplication::instance()->setProperty(kBusyProperty, true);
}

void InputGuard::drain()
{
    QCoreApplication::processEvents();
}

bool InputGuard::eventFilter(QObject *watched, QEvent *event)
{
    Q_UNUSED(watched)
    if (event->type() == QEvent::Close) {
        event->ignore();
        return true;
    }
    return std::find(std::begin(kInput), std::end(kInput), event->type()) != std::end(kInput);
}
