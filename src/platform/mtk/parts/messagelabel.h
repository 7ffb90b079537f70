// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QHash>
#include <QLabel>
#include <QTextLayout>

namespace Mtk::Widget {

// A label whose plain text breaks anywhere when a word is longer than a line, so that no text is ever cut.
// Height follows width. A text is laid out once for each width that is asked for. The mouse selects text,
// which never takes the keyboard's focus. Everything else (accessible name, colors) is QLabel's.
class MessageLabel : public QLabel
{
    Q_OBJECT

public:
    explicit MessageLabel(QWidget *parent);

    // A text longer than kMaxLength is shown up to there, with an ellipsis and one warning, so that whatever
    // a program is given to show can be laid out at once.
    void setText(const QString &text);
    static constexpr int kMaxLength = 16384; // UTF-16 units, a hundred times what a dialog can show at once

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;
    bool hasHeightForWidth() const override { return true; }
    int heightForWidth(int width) const override;
    // Width of the longest line without wrapping, in logical pixels.
    int naturalWidth() const;

    void selectAll();
    QString selectedText() const;

protected:
    void changeEvent(QEvent *event) override;
    void mousePressEvent(QMouseEvent *event) override;
    void mouseMoveEvent(QMouseEvent *event) override;
    void mouseReleaseEvent(QMouseEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    static constexpr int kNotLaidOut = -1;

    void forget();
    void select(int anchor, int end);
    int positionAt(const QPoint &place) const;
    QSizeF extentFor(int width) const;
    void layOut(int width) const;

    mutable QTextLayout m_layout;
    mutable int m_layoutWidth = kNotLaidOut;
    mutable QHash<int, QSizeF> m_extents; // by width, of the present text in the present font
    int m_anchor = 0;                     // the selection, as positions in the layout's text
    int m_end = 0;
};

} // namespace Mtk::Widget
