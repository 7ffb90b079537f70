// SPDX-License-Identifier: Apache-2.0
#include "mpasswordedit.h"

#include "parts/glyphbutton.h"

#include <QLineEdit>

namespace Mtk::Widget {

namespace {

// For input methods, which must not learn it, and for the filter of what assistive technology is told.
constexpr Qt::InputMethodHints kSecret =
    Qt::ImhHiddenText | Qt::ImhSensitiveData | Qt::ImhNoPredictiveText | Qt::ImhNoAutoUppercase;

} // namespace

MPasswordEdit::MPasswordEdit(QWidget *parent)
    : MLineEdit(parent)
    , m_revealButton(new GlyphButton(Glyph::Reveal, QString(), this))
{
    m_revealButton->setFocusPolicy(Qt::TabFocus);
    addTrailing(m_revealButton);
    setRevealed(false);
    connect(m_revealButton, &GlyphButton::clicked, this,
            [this] { setRevealed(lineEdit()->echoMode() == QLineEdit::Password); });
}

MPasswordEdit::~MPasswordEdit() = default;

void MPasswordEdit::hideEvent(QHideEvent *event)
{
    MLineEdit::hideEvent(event);
    if (lineEdit()->echoMode() != QLineEdit::Password)
        setRevealed(false);
}

void MPasswordEdit::setRevealed(bool revealed)
{
    QLineEdit *edit = lineEdit();
    const int cursor = edit->cursorPosition();
    // Forgets what undo could bring back into view.
    edit->setText(edit->text());
    edit->setCursorPosition(cursor);
    edit->setEchoMode(revealed ? QLineEdit::Normal : QLineEdit::Password);
    edit->setInputMethodHints(kSecret); // a normal echo has just taken them away
    m_revealButton->setGlyph(revealed ? Glyph::Mask : Glyph::Reveal,
                             revealed ? QStringLiteral("隐藏密码") : QStringLiteral("显示密码"));
}

} // namespace Mtk::Widget
