// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QColor>
#include <QFont>
#include <QLabel>
#include <QList>
#include <QString>

class QGridLayout;
class QHBoxLayout;
class QPushButton;
class QVBoxLayout;
class QWidget;

namespace Mtk {
namespace Widget {
class MDialog;
class MLineEdit;
} // namespace Widget
} // namespace Mtk

// What the pages of the wizard and the leave panel have in common: fonts, sizes, captions, button rows and
// the message box. A page itself holds only what differs. Sizes are in device-independent pixels.
namespace pageparts {

constexpr QSize kCaptionSize(80, 20);
constexpr QSize kFieldSize(270, 36);
constexpr QSize kHalfButtonSize(170, 36); // one of two buttons in a row
constexpr QSize kWideButtonSize(360, 36); // a button alone

// Weights of QFont.
constexpr int kHeadingWeight = 57;
constexpr int kBodyWeight = 50;

const QColor kHeadingColour(0, 0, 0, 245);
const QColor kCaptionColour(0, 0, 0, 178);
const QColor kValueColour(0, 26, 46, 255);

QFont pageFont(int weight);

// The window text of `widget` for all colour groups.
void setTextColour(QWidget *widget, const QColor &colour);

// A label in the font and colour of a heading.
QLabel *heading(const QString &text, const QFont &font, QWidget *parent);

// The looks of a field's caption, which stands left of it.
void dressCaption(QLabel *caption, const QFont &font);

// The looks of an edit; its caption, without blanks and colon, is its name for a screen reader.
void dressField(Mtk::Widget::MLineEdit *edit, const QString &caption, const QFont &font);

// The two rows of captions and fields that three pages have, in a container of `page`. The fields stand in
// the second column.
QWidget *fieldGrid(QWidget *page, QLabel *upperCaption, QWidget *upperField, QLabel *lowerCaption,
                   QWidget *lowerField, Qt::Alignment captionAlignment = {});

// For the keyboard: `page` passes the focus that it is given on to `first`, and Enter in one of `fields`
// presses `next`, where that is enabled.
void serveKeyboard(QWidget *page, QWidget *first, const QList<Mtk::Widget::MLineEdit *> &fields,
                   QPushButton *next);

// `left` and `right` at the standard size in one row, with a separator between them, which becomes a child of
// `page`.
QHBoxLayout *buttonRow(QWidget *page, QPushButton *left, QPushButton *right);

// Heading, fields and buttons from top to bottom, as the layout of `page`.
void layOutFieldPage(QWidget *page, QLabel *title, QWidget *fields, QHBoxLayout *buttons);

// After an edit of one of two fields: an empty one takes `button` away, two filled ones give it; an edit that
// leaves the other field empty changes nothing.
void enableForTwo(QPushButton *button, const QString &edited, const QString &other);

// Font, text and the one button of a message.
void dressMessage(Mtk::Widget::MDialog &dialog, const QString &text, const QString &button);

// Shows `text` in a modal dialog over `parent` with one button, and returns when it is dismissed.
void showMessage(QWidget *parent, const QString &text, const QString &button = QStringLiteral("确定"));

} // namespace pageparts
