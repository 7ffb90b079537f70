// SPDX-License-Identifier: Apache-2.0
// How a dialog opens, is answered and closes.
#include "mdialog.h"

#include "parts/dialogtext.h"
#include "style/theme.h"

#include <QAbstractButton>
#include <QClipboard>
#include <QGuiApplication>
#include <QKeyEvent>
#include <QLayout>
#include <QPointer>
#include <QScreen>

namespace Mtk::Widget {

namespace {

constexpr int kNoButton = -1;
constexpr int kMinLines = 3; // of the text, however small the screen

} // namespace

int MDialog::exec()
{
    m_pressed = kNoButton;
    const QPointer<MDialog> self(this);
    QDialog::exec();
    return self ? m_pressed : kNoButton;
}

void MDialog::setVisible(bool visible)
{
    if (visible) {
        if (!m_open)
            m_pressed = kNoButton;
        m_open = true;
        limitHeight();
        placeOverParent();
        takeInitialFocus();
        QDialog::setVisible(true);
        return;
    }
    const QPointer<MDialog> self(this);
    QDialog::setVisible(false);
    if (self)
        setAttribute(Qt::WA_Moved, false); // so that it is centered again the next time
    if (self && m_open) {
        m_open = false;
        Q_EMIT closed();
    }
}

void MDialog::reject()
{
    done(kNoButton);
}

void MDialog::keyPressEvent(QKeyEvent *event)
{
    if (event->matches(QKeySequence::SelectAll)) {
        m_text->selectAll();
        return;
    }
    if (event->matches(QKeySequence::Copy)) {
        const QString text = m_text->selectedText();
        if (!text.isEmpty())
            QGuiApplication::clipboard()->setText(text);
        return;
    }
    if (event->key() != Qt::Key_Return && event->key() != Qt::Key_Enter) {
        MAbstractDialog::keyPressEvent(event);
        return;
    }
    QAbstractButton *button = answerButton();
    if (button && button->isEnabled())
        button->click();
}

void MDialog::press(int index)
{
    if (m_pressed != kNoButton)
        return; // slots of the first press are still running
    m_pressed = index;
    // Hidden at once: slots may take long, and show messages of their own.
    QDialog::setVisible(false);
    const QPointer<MDialog> self(this);
    Q_EMIT buttonClicked(index, m_buttons.at(index)->text());
    if (self)
        done(index);
}

void MDialog::limitHeight()
{
    layout()->activate();
    const int others = height() - (m_text->isHidden() ? 0 : m_text->height());
    const int max = screen()->size().height() * 3 / 4;
    m_text->setHeightLimit(qMax(kMinLines * fontMetrics().lineSpacing(), max - others));
    layout()->activate();
}

// QDialog would leave room for a frame that this window doesn't have.
void MDialog::placeOverParent()
{
    if (isVisible() || testAttribute(Qt::WA_Moved))
        return;
    const QWidget *below = parentWidget() ? parentWidget()->window() : nullptr;
    const QRect area = screen()->availableGeometry();
    QRect place(QPoint(), size());
    place.moveCenter(area.center());
    if (below && below->isVisible()) {
        place.moveCenter(below->geometry().center());
        // Else a small window would be out of sight.
        place.moveTop(qMax(place.top(), below->y() + theme().titlebarHeight));
    }
    place.moveRight(qMin(place.right(), area.right()));
    place.moveBottom(qMin(place.bottom(), area.bottom()));
    place.moveLeft(qMax(place.left(), area.left()));
    place.moveTop(qMax(place.top(), area.top()));
    move(place.topLeft());
}

void MDialog::takeInitialFocus()
{
    if (focusWidget() && focusWidget() != this)
        return;
    QWidget *target = firstField();
    if (!target)
        target = answerButton();
    if (!target && !m_buttons.isEmpty())
        target = m_buttons.constLast();
    if (target)
        target->setFocus();
}

// The first widget among the contents that takes the keyboard's focus.
QWidget *MDialog::firstField() const
{
    for (QWidget *w = nextInFocusChain(); w != this; w = w->nextInFocusChain()) {
        const bool own = m_buttons.contains(qobject_cast<QAbstractButton *>(w)) || m_text->isAncestorOf(w);
        const bool takesFocus = (w->focusPolicy() & Qt::TabFocus) && !w->focusProxy() && w->isEnabled();
        if (!own && w != m_text && takesFocus && w->isVisibleTo(this))
            return w;
    }
    return nullptr;
}

QAbstractButton *MDialog::answerButton() const
{
    auto *focused = qobject_cast<QAbstractButton *>(focusWidget());
    if (m_buttons.contains(focused))
        return focused;
    if (m_default)
        return m_default;
    if (m_recommended)
        return m_recommended;
    return m_buttons.size() == 1 ? m_buttons.constFirst() : nullptr;
}

} // namespace Mtk::Widget
