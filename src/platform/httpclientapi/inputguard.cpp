// SPDX-License-Identifier: Apache-2.0
#include "inputguard.h"

#include <QCoreApplication>
#include <QEvent>

namespace {

constexpr char kBusyProperty[] = "busy";

bool isInput(QEvent::Type type)
{
    switch (type) {
    case QEvent::MouseButtonPress:
    case QEvent::MouseButtonRelease:
    case QEvent::MouseButtonDblClick:
    case QEvent::MouseMove:
    case QEvent::NonClientAreaMouseButtonPress:
    case QEvent::NonClientAreaMouseButtonRelease:
    case QEvent::NonClientAreaMouseButtonDblClick:
    case QEvent::NonClientAreaMouseMove:
    case QEvent::Wheel:
    case QEvent::KeyPress:
    case QEvent::KeyRelease:
    case QEvent::Shortcut:
    case QEvent::ShortcutOverride:
    case QEvent::InputMethod:
    case QEvent::ContextMenu:
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
    case QEvent::TouchCancel:
    case QEvent::TabletPress:
    case QEvent::TabletMove:
    case QEvent::TabletRelease:
    case QEvent::NativeGesture:
    case QEvent::Gesture:
    case QEvent::GestureOverride:
    case QEvent::DragEnter:
    case QEvent::DragMove:
    case QEvent::DragLeave:
    case QEvent::Drop:
        return true;
    default:
        return false;
    }
}

} // namespace

InputGuard::InputGuard()
    : m_busyBefore(QCoreApplication::instance()->property(kBusyProperty))
{
    QCoreApplication::instance()->installEventFilter(this);
    QCoreApplication::instance()->setProperty(kBusyProperty, true);
}

InputGuard::~InputGuard()
{
    QCoreApplication::instance()->removeEventFilter(this);
    QCoreApplication::instance()->setProperty(kBusyProperty, m_busyBefore);
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
    return isInput(event->type());
}
