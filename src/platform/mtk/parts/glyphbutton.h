// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "style/glyph.h"

#include <QAbstractButton>

namespace Mtk::Widget {

// A small square button that shows a glyph: the window buttons of MTitlebar, the buttons inside an edit. Its
// name is what screen readers and the tool tip say, and is not drawn.
class GlyphButton : public QAbstractButton
{
    Q_OBJECT

public:
    GlyphButton(Glyph glyph, const QString &name, QWidget *parent);

    void setGlyph(Glyph glyph, const QString &name);
    // Turns red under the pointer, as a button that closes something does.
    void setDestructive(bool destructive);

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    Glyph m_glyph;
    bool m_destructive = false;
};

} // namespace Mtk::Widget
