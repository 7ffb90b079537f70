// SPDX-License-Identifier: Apache-2.0
#include "section.h"

#include "mtk/mlabel.h"

#include <QGridLayout>
#include <QPushButton>
#include <QVariant>

namespace Gallery {

namespace {

constexpr int kSpacing = 16;
constexpr char kFocused[] = "galleryFocused";

QWidget *caption(const QString &text)
{
    auto *label = new Mtk::Widget::MLabel;
    label->setText(text);
    QPalette palette = label->palette();
    palette.setColor(QPalette::WindowText, QColor(0, 0, 0, 150));
    label->setPalette(palette);
    return label;
}

} // namespace

StateGrid::StateGrid(const QStringList &states)
    : m_page(new QWidget)
    , m_grid(new QGridLayout(m_page))
{
    m_grid->setContentsMargins(kSpacing, kSpacing, kSpacing, kSpacing);
    m_grid->setSpacing(kSpacing);
    for (int i = 0; i < states.size(); ++i)
        m_grid->addWidget(caption(states.at(i)), 0, i + 1, Qt::AlignHCenter);
}

void StateGrid::addRow(const QString &text, const QVector<QWidget *> &cells)
{
    const int row = m_grid->rowCount();
    m_grid->addWidget(caption(text), row, 0, Qt::AlignRight | Qt::AlignVCenter);
    for (int i = 0; i < cells.size(); ++i)
        m_grid->addWidget(cells.at(i), row, i + 1, Qt::AlignCenter);
    for (QWidget *cell : cells) {
        if (cell->property(kFocused).toBool())
            cell->setFocus();
    }
}

QWidget *hovered(QWidget *widget)
{
    widget->setAttribute(Qt::WA_UnderMouse);
    return widget;
}

QPushButton *pressed(QPushButton *button)
{
    button->setDown(true);
    return button;
}

QWidget *disabled(QWidget *widget)
{
    widget->setEnabled(false);
    return widget;
}

QWidget *focused(QWidget *widget)
{
    widget->setProperty(kFocused, QVariant(true));
    return widget;
}

} // namespace Gallery
