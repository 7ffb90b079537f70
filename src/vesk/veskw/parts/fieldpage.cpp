// SPDX-License-Identifier: Apache-2.0
#include "fieldpage.h"

#include "pageparts.h"

#include "mtk/mlineedit.h"
#include "mtk/msuggestbutton.h"

#include <QBoxLayout>
#include <QGridLayout>
#include <QLabel>
#include <QLineEdit>
#include <QRegExp>

using Mtk::Widget::MLineEdit;
using Mtk::Widget::MSuggestButton;

FieldPage::FieldPage(QWidget *page, const QString &title, const QFont &titleFont, const QFont &font)
    : m_page(page)
    , m_title(pageparts::heading(title, titleFont, page))
    , m_font(font)
    , m_fields(new QWidget(page))
    , m_grid(new QGridLayout(m_fields))
{
    m_grid->setSpacing(10);
    m_grid->setContentsMargins(0, 10, 0, 10);
    m_grid->setRowStretch(1, 10);
    m_grid->setColumnStretch(0, 10);
}

void FieldPage::addRow(QLabel *caption, const QString &text, MLineEdit *edit, Qt::Alignment captionAlignment)
{
    add(caption, text, edit, captionAlignment);
    edit->setFixedSize(pageparts::kFieldSize);
    edit->setFont(m_font);
    caption->setBuddy(edit);
    edit->setAccessibleName(QString(text).remove(QRegExp(QStringLiteral("[\\s:]"))));
    if (m_edits.isEmpty())
        m_page->setFocusProxy(edit);
    m_edits.append(edit);
}

void FieldPage::addRow(QLabel *caption, const QString &text, QLabel *value)
{
    add(caption, text, value, {});
    pageparts::setValueLooks(value, m_font);
}

void FieldPage::add(QLabel *caption, const QString &text, QWidget *field, Qt::Alignment captionAlignment)
{
    const int row = m_grid->count() / 2;
    pageparts::setCaption(caption, text, m_font);
    m_grid->addWidget(caption, row, 0, 1, 1, captionAlignment);
    m_grid->addWidget(field, row, 1, 1, 5);
}

void FieldPage::addButtons(const QString &left, const QString &right)
{
    m_left = new QPushButton(left, m_page);
    m_left->setFont(m_font);
    m_right = new MSuggestButton(m_page);
    m_right->setText(right);
    m_right->setFont(m_font);
    for (MLineEdit *edit : qAsConst(m_edits))
        QObject::connect(edit->lineEdit(), &QLineEdit::returnPressed, m_right, &QPushButton::click);

    auto *layout = new QVBoxLayout(m_page);
    layout->setContentsMargins(10, 0, 10, 12);
    layout->setSpacing(0);
    layout->addWidget(m_title, 0, Qt::AlignCenter | Qt::AlignTop);
    layout->addWidget(m_fields);
    layout->addLayout(pageparts::buttonRow(m_page, m_left, m_right));
}

void enableForTwo(QPushButton *button, const QString &edited, const QString &other)
{
    if (edited.isEmpty())
        button->setEnabled(false);
    else if (!other.isEmpty())
        button->setEnabled(true);
}
