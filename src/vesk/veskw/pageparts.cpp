// SPDX-License-Identifier: Apache-2.0
#include "pageparts.h"

#include "mtk/mdialog.h"
#include "mtk/mframe.h"
#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"

#include <QBoxLayout>
#include <QGridLayout>
#include <QLineEdit>
#include <QPalette>
#include <QPushButton>
#include <QRegExp>

using Mtk::Widget::MDialog;
using Mtk::Widget::MFrame;
using Mtk::Widget::MLabel;
using Mtk::Widget::MLineEdit;

namespace pageparts {

QFont pageFont(int weight)
{
    QFont font(QStringLiteral("Source Han Sans CN"), 14, weight, false);
    font.setPixelSize(14);
    return font;
}

void setTextColour(QWidget *widget, const QColor &colour)
{
    QPalette palette;
    palette.setBrush(QPalette::All, QPalette::WindowText, colour);
    widget->setPalette(palette);
}

QLabel *heading(const QString &text, const QFont &font, QWidget *parent)
{
    auto *label = new MLabel(parent);
    label->setText(text);
    label->setFont(font);
    setTextColour(label, kHeadingColour);
    return label;
}

void dressCaption(QLabel *caption, const QFont &font)
{
    caption->setFixedSize(kCaptionSize);
    caption->setFont(font);
    caption->setAlignment(Qt::AlignRight | Qt::AlignVCenter);
    setTextColour(caption, kCaptionColour);
}

void dressField(MLineEdit *edit, const QString &caption, const QFont &font)
{
    edit->setFixedSize(kFieldSize);
    edit->setFont(font);
    edit->setAccessibleName(QString(caption).remove(QRegExp(QStringLiteral("[\\s:]"))));
}

QWidget *fieldGrid(QWidget *page, QLabel *upperCaption, QWidget *upperField, QLabel *lowerCaption,
                   QWidget *lowerField, Qt::Alignment captionAlignment)
{
    auto *container = new QWidget(page);
    auto *grid = new QGridLayout(container);
    grid->setSpacing(10);
    grid->setContentsMargins(0, 10, 0, 10);
    grid->addWidget(upperCaption, 0, 0, 1, 1, captionAlignment);
    grid->addWidget(upperField, 0, 1, 1, 5);
    grid->addWidget(lowerCaption, 1, 0, 1, 1, captionAlignment);
    grid->addWidget(lowerField, 1, 1, 1, 5);
    grid->setRowStretch(1, 10);
    grid->setColumnStretch(0, 10);
    return container;
}

void serveKeyboard(QWidget *page, QWidget *first, const QList<MLineEdit *> &fields, QPushButton *next)
{
    page->setFocusProxy(first);
    for (MLineEdit *field : fields)
        QObject::connect(field->lineEdit(), &QLineEdit::returnPressed, next, &QPushButton::click);
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

void layOutFieldPage(QWidget *page, QLabel *title, QWidget *fields, QHBoxLayout *buttons)
{
    auto *layout = new QVBoxLayout(page);
    layout->setContentsMargins(10, 0, 10, 12);
    layout->setSpacing(0);
    layout->addWidget(title, 0, Qt::AlignCenter | Qt::AlignTop);
    layout->addWidget(fields);
    layout->addLayout(buttons);
}

void enableForTwo(QPushButton *button, const QString &edited, const QString &other)
{
    if (edited.isEmpty())
        button->setEnabled(false);
    else if (!other.isEmpty())
        button->setEnabled(true);
}

void dressMessage(MDialog &dialog, const QString &text, const QString &button)
{
    dialog.setFont(pageFont(kBodyWeight));
    dialog.setMessage(text);
    dialog.addButton(button, false, MDialog::ButtonNormal);
}

void showMessage(QWidget *parent, const QString &text, const QString &button)
{
    MDialog dialog(parent);
    dressMessage(dialog, text, button);
    dialog.exec();
}

} // namespace pageparts
