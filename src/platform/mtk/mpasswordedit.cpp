// SPDX-License-Identifier: Apache-2.0
#include "mpasswordedit.h"

#include "parts/glyphbutton.h"

#include <QLineEdit>

namespace Mtk::Widget {

MPasswordEdit::MPasswordEdit(QWidget *parent)
    : MLineEdit(parent)
    , m_revealButton(new GlyphButton(Glyph::Reveal, QString(), this))
{
    lineEdit()->setInputMethodHints(Qt::ImhHiddenText | Qt::ImhSensitiveData | Qt::ImhNoPredictiveText |
                                    Qt::ImhNoAutoUppercase);
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
    // Not when it is masked already: Qt tells assistive technology, in clear, of every text that is set.
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
    m_revealButton->setGlyph(revealed ? Glyph::Mask : Glyph::Reveal,
                             revealed ? QStringLiteral("隐藏密码") : QStringLiteral("显示密码"));
}

} // namespace Mtk::Widget
