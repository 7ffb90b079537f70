// SPDX-License-Identifier: Apache-2.0
#include "inputgate.h"

#include "accessiblebutton.h"
#include "xdesktop.h"

#include <QAbstractButton>
#include <QAccessible>
#include <QApplication>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QSignalBlocker>
#include <QWindow>

namespace Mtk {

namespace {

bool isInput(const QEvent &event)
{
    switch (event.type()) {
    case QEvent::HoverEnter:
    case QEvent::HoverLeave:
    case QEvent::HoverMove:
        return false;
    case QEvent::Shortcut:
    case QEvent::InputMethod:
    case QEvent::DragEnter:
    case QEvent::DragMove:
    case QEvent::Drop:
        return true;
    default:
        return dynamic_cast<const QInputEvent *>(&event) != nullptr;
    }
}

bool isBehindModal(const QWidget &widget)
{
    const QWidget *modal = QApplication::activeModalWidget();
    if (modal == nullptr)
        return false;
    for (const QWidget *each = &widget; each != nullptr; each = each->parentWidget()) {
        if (each == modal)
            return false;
    }
    if (modal->windowModality() == Qt::ApplicationModal)
        return true;
    for (const QWidget *below = modal->parentWidget(); below != nullptr; below = below->parentWidget()) {
        if (below->window() == widget.window())
            return true;
    }
    return false;
}

bool pressesSomething(const QKeyEvent &event)
{
    switch (event.key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Escape:
        return true;
    case Qt::Key_Space: {
        const QWidget *focus = QApplication::focusWidget();
        return focus == nullptr || !focus->testAttribute(Qt::WA_InputMethodEnabled);
    }
    default:
        return false;
    }
}

template <typename Visit>
void visitButtons(const QWidgetList &widgets, const Visit &visit)
{
    for (QWidget *widget : widgets) {
        if (auto *button = qobject_cast<QAbstractButton *>(widget))
            visit(button);
    }
}

// Assistive technology may cache the states of widgets, so it is told that these have changed.
void notifyScreenReaders(const QWidgetList &widgets)
{
    if (!QAccessible::isActive())
        return;
    visitButtons(widgets, [](QAbstractButton *button) {
        if (!button->isVisible())
            return;
        QAccessible::State changed;
        changed.disabled = true;
        QAccessibleStateChangeEvent event(button, changed);
        QAccessible::updateAccessibility(&event);
    });
}

} // namespace

int InputGate::s_busySections = 0;

InputGate::InputGate(QObject *application)
{
    QAccessible::installFactory(accessibleButton);
    application->installEventFilter(this);
    connect(qGuiApp, &QGuiApplication::focusWindowChanged, this, &InputGate::forgetReleasedKeys);
}

InputGate::~InputGate()
{
    QAccessible::removeFactory(accessibleButton);
}

void InputGate::setBusy(bool busy)
{
    if (busy) {
        ++s_busySections;
        m_dropped.clear();
    }
    dropPresses();
    m_isBusy = busy;
    notifyScreenReaders(QApplication::allWidgets());
}

// A release outside of a button makes it forget that the mouse has pressed it.
void InputGate::dropPresses()
{
    visitButtons(QApplication::allWidgets(), [this](QAbstractButton *button) {
        if (!button->isDown())
            return;
        m_dropped.append(button);
        button->setDown(false);
        QMouseEvent release(QEvent::MouseButtonRelease, QPointF(-1, -1), Qt::LeftButton, Qt::NoButton,
                            Qt::NoModifier);
        static_cast<QObject *>(button)->event(&release);
    });
}

bool InputGate::isOpen(const QWidget &widget)
{
    return widget.isVisible() && !isBehindModal(widget) &&
           !QCoreApplication::instance()->property("busy").toBool();
}

// Windows get a key event first, and hand it on to their widgets. One that is not spontaneous has been here
// before: Qt's bridge keeps each back until screen readers have seen it, and posts it again.
bool InputGate::isRepeatedPress(const QObject &receiver, const QEvent &event)
{
    if (!receiver.isWindowType() || !event.spontaneous() ||
        (event.type() != QEvent::KeyPress && event.type() != QEvent::KeyRelease))
        return false;
    const auto &key = static_cast<const QKeyEvent &>(event);
    return m_keys.isRepeat(key) && pressesSomething(key);
}

// A release goes to whoever has the focus then, which may be nobody while one window hides and the next is
// still to show. Only X servers go on repeating a key in another window, and they tell which are down.
void InputGate::forgetReleasedKeys(const QWindow *focus)
{
    if (focus != nullptr && !m_keys.isEmpty())
        m_keys.keepOnly(XDesktop::instance().keysDown());
}

bool InputGate::eventFilter(QObject *watched, QEvent *event)
{
    if (m_isBusy && event->type() == QEvent::Close)
        event->ignore();
    if (m_isBusy && (isInput(*event) || event->type() == QEvent::Close))
        return true;
    switch (event->type()) {
    case QEvent::Timer:
        return endPress(qobject_cast<QAbstractButton *>(watched), event);
    case QEvent::WindowBlocked:
    case QEvent::WindowUnblocked:
        if (auto *window = qobject_cast<QWidget *>(watched))
            notifyScreenReaders(window->findChildren<QWidget *>());
        return false;
    default:
        return false;
    }
}

// A press by a shortcut is shown for a moment and ended by a timer (QAbstractButton::animateClick), which may
// be after the gate has closed. The button stops its timer only when it gets the event, so it gets the event
// with its signals blocked. A checkable one would still change its state, and is left to Qt.
bool InputGate::endPress(QAbstractButton *button, QEvent *timer)
{
    if (button == nullptr || button->isCheckable())
        return false;
    const bool isDropped = m_dropped.removeAll(button) > 0 && !button->isDown();
    if (!isDropped && (!button->isDown() || isOpen(*button)))
        return false;
    const QSignalBlocker silent(button);
    static_cast<QObject *>(button)->event(timer);
    return true;
}

} // namespace Mtk
