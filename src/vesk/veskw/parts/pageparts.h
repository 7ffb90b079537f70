// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QColor>
#include <QFont>
#include <QSize>
#include <QString>

class QHBoxLayout;
class QLabel;
class QPushButton;
class QWidget;

namespace Mtk::Widget {
class MDialog;
} // namespace Mtk::Widget

// What the pages of the wizard and the leave panel have in common: sizes, fonts, colors, captions, button
// rows and the message box. A page itself holds only what differs. Sizes are in device-independent pixels.
namespace pageparts {

constexpr int kPageWidth = 380;
constexpr QSize kFieldPageSize(kPageWidth, 187); // of the three pages with two fields
constexpr QSize kSummarySize(kPageWidth, 258);
constexpr QSize kProgressSize(kPageWidth, 109);
constexpr QSize kPanelSize(kPageWidth, 90); // of the leave panel and of the success page

constexpr QSize kCaptionSize(80, 20);
constexpr QSize kFieldSize(270, 36);
constexpr QSize kHalfButtonSize(170, 36); // one of two buttons in a row
constexpr QSize kWideButtonSize(360, 36); // a button alone

// Weights of QFont.
constexpr int kHeadingWeight = 57;
constexpr int kBodyWeight = 50;

constexpr QColor kHeadingColor(0, 0, 0, 245);
constexpr QColor kCaptionColor(0, 0, 0, 178);
constexpr QColor kValueColor(0, 26, 46, 255);

// Of a field for an account's name; those of a password are the toolkit's.
constexpr Qt::InputMethodHints kAccountHints = Qt::ImhNoAutoUppercase | Qt::ImhNoPredictiveText;

QFont pageFont(int weight);

// The window text of `widget` for all color groups.
void setTextColor(QWidget *widget, const QColor &color);

// A label in the font and color of a heading, which a screen reader hears as the description of `page`.
QLabel *heading(const QString &text, const QFont &font, QWidget *page);

// Text and looks of a field's caption, which stands left of it.
void setCaption(QLabel *caption, const QString &text, const QFont &font);

// The looks of a label that shows a foreign value, as plain text.
void setValueLooks(QLabel *value, const QFont &font);

// `left` and `right` at the standard size in one row, with a separator between them, which becomes a child of
// `page`.
QHBoxLayout *buttonRow(QWidget *page, QPushButton *left, QPushButton *right);

// Font, text and the one button of a message.
void setMessage(Mtk::Widget::MDialog &dialog, const QString &text, const QString &button);

// Shows `text` in a modal dialog over `parent` with one button, and returns when it is dismissed.
void showMessage(QWidget *parent, const QString &text, const QString &button = QStringLiteral("确定"));

} // namespace pageparts
