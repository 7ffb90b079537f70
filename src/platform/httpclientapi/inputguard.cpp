// SPDX-License-Identifier: Apache-2.0
#include "inputguard.h"

#include <QCoreApplication>
#include <QEvent>
#include <QVariant>

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
    return isInput(event->type());
}
