// SPDX-License-Identifier: Apache-2.0
#include "pageparts.h"

#include "mtk/mdialog.h"
#include "mtk/mframe.h"
#include "mtk/mlabel.h"

#include <QBoxLayout>
#include <QPalette>
#include <QPushButton>

using Mtk::Widget::MDialog;
using Mtk::Widget::MFrame;
using Mtk::Widget::MLabel;

namespace pageparts {

QFont pageFont(int weight)
{
    QFont font(QStringLiteral("Source Han Sans CN"), 14, weight, false);
    font.setPixelSize(14);
    return font;
}

void setTextColor(QWidget *widget, const QColor &color)
{
    QPalette palette;
    palette.setBrush(QPalette::All, QPalette::WindowText, color);
    widget->setPalette(palette);
}

QLabel *heading(const QString &text, const QFont &font, QWidget *page)
{
    page->setAccessibleDescription(text);
    auto *label = new MLabel(page);
    label->setText(text);
    label->setFont(font);
    setTextColor(label, kHeadingColor);
    return label;
}

void setCaption(QLabel *caption, const QString &text, const QFont &font)
{
    caption->setText(text);
    caption->setFixedSize(kCaptionSize);
    caption->setFont(font);
    caption->setAlignment(Qt::AlignRight | Qt::AlignVCenter);
    setTextColor(caption, kCaptionColor);
}

void setValueLooks(QLabel *value, const QFont &font)
{
    value->setFixedSize(kFieldSize);
    value->setFont(font);
    value->setTextFormat(Qt::PlainText);
    setTextColor(value, kValueColor);
}

QHBoxLayout *buttonRow(QWidget *page, QPushButton *left, QPushButton *right)
{
    auto *separator = new MFrame(page);
    separator->setFrameShape(QFrame::VLine);
    separator->setFixedSize(1, 28);
    for (QPushButton *button : {left, right}) {
        button->setFixedSize(kHalfButtonSize);
        button->setAutoDefault(true); // outside of dialogs, Enter would not press it
    }

    auto *row = new QHBoxLayout;
    row->addWidget(left, 0, Qt::AlignLeft);
    row->addWidget(separator);
    row->addWidget(right, 0, Qt::AlignRight);
    return row;
}

void setMessage(MDialog &dialog, const QString &text, const QString &button)
{
    dialog.setFont(pageFont(kBodyWeight));
    dialog.setMessage(text);
    dialog.addButton(button, false, MDialog::ButtonNormal);
}

void showMessage(QWidget *parent, const QString &text, const QString &button)
{
    MDialog dialog(parent);
    setMessage(dialog, text, button);
    dialog.exec();
}

} // namespace pageparts
