// SPDX-License-Identifier: Apache-2.0
#include "mdialog.h"

#include "msuggestbutton.h"
#include "mtitlebar.h"
#include "parts/dialogicon.h"
#include "parts/dialogtext.h"
#include "style/looks.h"
#include "style/theme.h"

#include <QPushButton>
#include <QVBoxLayout>
#include <QVariant>

namespace Mtk::Widget {

namespace {

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
    // While this is still an MDialog, so that closed() is sent for one that is destroyed while open.
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

void MDialog::nameForReaders()
{
    const bool titled = !m_text->title().isEmpty();
    setAccessibleName(titled ? m_text->title() : m_text->message());
    setAccessibleDescription(titled ? m_text->message() : QString());
}

} // namespace Mtk::Widget
