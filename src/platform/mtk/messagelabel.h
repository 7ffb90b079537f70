// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QLabel>

class QTextLayout;

namespace Mtk {
namespace Widget {

// A label whose plain text breaks anywhere when a word is longer than a line, so that no text is ever cut.
// Height follows width. Everything else about it (text, accessible name, colours) is QLabel's.
class MessageLabel : public QLabel
{
    Q_OBJECT

public:
    explicit MessageLabel(QWidget *parent);
    ~MessageLabel() override;

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;
    bool hasHeightForWidth() const override { return true; }
    int heightForWidth(int width) const override;
    // Of the longest line as the text has them, in logical pixels.
    int naturalWidth() const;

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    qreal breakLines(QTextLayout &layout, qreal width) const;
};

} // namespace Widget
} // namespace Mtk
