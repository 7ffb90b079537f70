// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QScrollArea>

namespace Mtk::Widget {

class MessageLabel;

// Title and message of a dialog. As high as its text up to a limit, past which it scrolls, by keyboard too.
class DialogText : public QScrollArea
{
    Q_OBJECT

public:
    explicit DialogText(QWidget *parent);

    void setTitle(const QString &title);
    void setMessage(const QString &message);
    // Of text that needs no wrapping; wrapped text is aligned left.
    void setTextAlignment(Qt::Alignment alignment);
    QString title() const;
    QString message() const;
    void selectAll();
    // What is selected of both, or the whole where nothing is.
    QString selectedText() const;

    // In logical pixels; the text scrolls when it needs more.
    void setHeightLimit(int limit);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;
    bool hasHeightForWidth() const override { return true; }
    int heightForWidth(int width) const override;

protected:
    void changeEvent(QEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    int textHeight(int width) const;
    void changed();

    MessageLabel *m_title;
    MessageLabel *m_message;
    int m_limit;
};

} // namespace Mtk::Widget
