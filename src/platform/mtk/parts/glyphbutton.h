// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "style/glyph.h"

#include <QAbstractButton>

namespace Mtk::Widget {

// A small square button that shows a glyph: the window buttons of MTitlebar, the buttons inside an edit. Its
// text is its accessible name and tool tip, and is not drawn.
class GlyphButton : public QAbstractButton
{
    Q_OBJECT

public:
    GlyphButton(Glyph glyph, const QString &name, QWidget *parent);

    void setGlyph(Glyph glyph, const QString &name);
    // Turns red under the pointer, as a button that ends something does.
    void setEnding(bool ending);

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    Glyph m_glyph;
    bool m_ending = false;
};

} // namespace Mtk::Widget
