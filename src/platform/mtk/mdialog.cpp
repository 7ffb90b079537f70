// SPDX-License-Identifier: Apache-2.0
#include "mdialog.h"

#include "msuggestbutton.h"
#include "mtitlebar.h"
#include "parts/dialogicon.h"
#include "parts/dialogtext.h"
#include "style/looks.h"
#include "style/theme.h"

#include <QKeyEvent>
#include <QPointer>
#include <QScreen>
#include <QVariant>
#include <QVBoxLayout>

namespace Mtk::Widget {

namespace {

constexpr int kNoButton = -1;
constexpr int kFewestLines = 3; // of the text, however small the screen

MTitlebar *closeBar(QWidget *dialog)
{
    auto *bar = new MTitlebar(dialog);
    bar->setMenuVisible(false);
    bar->setTitle(QString());
    bar->setIcon(QIcon());
    bar->setBackgroundTransparent(true);
    bar->setFixedHeight(theme().dialogTitlebarHeight);
    bar->setMinimumWidth(theme().dialogWidth);
    return bar;
}

QPushButton *buttonOfType(MDialog::ButtonType type, QWidget *dialog)
{
    if (type == MDialog::ButtonRecommended)
        return new MSuggestButton(dialog);
    auto *button = new QPushButton(dialog);
    if (type == MDialog::ButtonWarning)
        button->setProperty(Look::kDestructive, true);
    return button;
}

} // namespace

MDialog::MDialog(QWidget *parent)
    : MAbstractDialog(parent)
    , m_icon(new DialogIcon(this))
    , m_text(new DialogText(this))
    , m_contents(new QVBoxLayout)
    , m_buttonRow(new QHBoxLayout)
{
    const Theme &t = theme();
    auto *head = new QHBoxLayout;
    head->setSpacing(t.dialogSpacing);
    head->addWidget(m_icon, 0, Qt::AlignTop);
    head->addWidget(m_text, 1, Qt::AlignVCenter);
    m_contents->setSpacing(0);
    m_buttonRow->setSpacing(t.dialogSpacing);

    auto *body = new QVBoxLayout;
    body->setContentsMargins(t.dialogPadding, 0, t.dialogPadding, t.dialogPadding);
    body->setSpacing(t.dialogPadding);
    body->addLayout(head);
    body->addLayout(m_contents);
    body->addLayout(m_buttonRow);

    auto *whole = new QVBoxLayout(this);
    whole->setContentsMargins(0, 0, 0, 0);
    whole->setSpacing(0);
    whole->addWidget(closeBar(this));
    whole->addLayout(body);
    whole->setSizeConstraint(QLayout::SetFixedSize);
}

MDialog::~MDialog()
{
    // While this is still a whole dialog, so that one destroyed while open tells of its end too.
    hide();
}

void MDialog::setTitle(const QString &title)
{
    m_text->setTitle(title);
    setWindowTitle(m_text->title());
    nameForReaders();
}

void MDialog::setMessage(const QString &message)
{
    m_text->setMessage(message);
    nameForReaders();
}

void MDialog::setIcon(const QIcon &icon)
{
    m_icon->setIcon(icon);
    m_text->setTextAlignment(icon.isNull() ? Qt::AlignHCenter : Qt::AlignLeft);
}

void MDialog::addContent(QWidget *widget, Qt::Alignment alignment)
{
    m_contents->addWidget(widget, 0, alignment);
    if (isVisible())
        limitHeight();
}

int MDialog::addButton(const QString &text, bool isDefault, ButtonType type)
{
    QPushButton *button = buttonOfType(type, this);
    const int index = m_buttons.size();
    button->setText(text);
    // Which button Enter presses is decided here, not by QDialog.
    button->setAutoDefault(false);
    m_buttons.append(button);
    m_buttonRow->addWidget(button, 1);
    if (isDefault)
        m_default = button;
    if (type == ButtonRecommended && !m_recommended)
        m_recommended = button;
    connect(button, &QPushButton::clicked, this, [this, index] { press(index); });
    if (isVisible())
        limitHeight();
    return index;
}

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
        // Shows from the first moment what Enter would press.
        setAttribute(Qt::WA_KeyboardFocusChange);
        return;
    }
    const QPointer<MDialog> self(this);
    QDialog::setVisible(false);
    if (self)
        setAttribute(Qt::WA_Moved, false); // where the user moved it is of no meaning for the next time
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
        return; // the listeners of the first press are still at work
    m_pressed = index;
    // Out of sight at once: the listeners may work for long, and show messages of their own.
    QDialog::setVisible(false);
    const QPointer<MDialog> self(this);
    Q_EMIT buttonClicked(index, m_buttons.at(index)->text());
    if (self)
        done(index);
}

void MDialog::nameForReaders()
{
    const bool titled = !m_text->title().isEmpty();
    setAccessibleName(titled ? m_text->title() : m_text->message());
    setAccessibleDescription(titled ? m_text->message() : QString());
}

void MDialog::limitHeight()
{
    layout()->activate();
    const int others = height() - (m_text->isHidden() ? 0 : m_text->height());
    const int most = screen()->size().height() * 3 / 4;
    m_text->setHeightLimit(qMax(kFewestLines * fontMetrics().lineSpacing(), most - others));
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
    place.moveCenter(below && below->isVisible() ? below->geometry().center() : area.center());
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
