// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFont>
#include <QString>

class QGridLayout;
class QLabel;
class QPushButton;
class QWidget;

namespace Mtk::Widget {
class MLineEdit;
class MSuggestButton;
} // namespace Mtk::Widget

// Builds what three pages of the wizard look like: a heading, rows of caption and field, a row of two
// buttons. Lives as long as the building takes; all widgets belong to the page.
class FieldPage
{
public:
    // `font` is that of everything but the heading.
    FieldPage(QWidget *page, const QString &title, const QFont &titleFont, const QFont &font);

    // Rows come from top to bottom. The caption without blanks and colon is the edit's name for a screen
    // reader; the first edit gets the focus that the page is given.
    void addRow(QLabel *caption, const QString &text, Mtk::Widget::MLineEdit *edit,
                Qt::Alignment captionAlignment = {});
    void addRow(QLabel *caption, const QString &text, QLabel *value);

    // The last step: makes both buttons and lays out the page. Enter in an edit presses the right button,
    // where that is enabled.
    void addButtons(const QString &left, const QString &right);
    QPushButton *leftButton() const { return m_left; }
    Mtk::Widget::MSuggestButton *rightButton() const { return m_right; }

private:
    void add(QLabel *caption, const QString &text, QWidget *field, Qt::Alignment captionAlignment);

    QWidget *m_page;
    QLabel *m_title;
    QFont m_font;
    QWidget *m_fields;
    QGridLayout *m_grid;
    QList<Mtk::Widget::MLineEdit *> m_edits;
    QPushButton *m_left = nullptr;
    Mtk::Widget::MSuggestButton *m_right = nullptr;
};

// After an edit of one of two fields: an empty one takes `button` away, two filled ones give it; an edit that
// leaves the other field empty changes nothing.
void enableForTwo(QPushButton *button, const QString &edited, const QString &other);
