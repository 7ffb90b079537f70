// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QVector>

#include <functional>

class QGridLayout;
class QPushButton;
class QWidget;

namespace Gallery {

// One page of the gallery: widgets that belong together, in all their states. `make` gives a new widget
// without a parent; when that is a window of its own (a dialog, a popup), the gallery opens it from a button.
struct Section
{
    QString name; // of its screenshot
    QString title;
    std::function<QWidget *()> make;
};

QVector<Section> controlSections();
QVector<Section> surfaceSections();

// A page with a row for each kind of widget and a column for each state.
class StateGrid
{
public:
    explicit StateGrid(const QStringList &states);

    void addRow(const QString &caption, const QVector<QWidget *> &cells);
    QWidget *page() const { return m_page; }

private:
    QWidget *m_page;
    QGridLayout *m_grid;
};

// States that a screenshot can show without a mouse.
QWidget *hovered(QWidget *widget);
QPushButton *pressed(QPushButton *button);
QWidget *disabled(QWidget *widget);
// Takes the focus, as by Tab, when its window is shown. One widget of a page can have it.
QWidget *focused(QWidget *widget);

} // namespace Gallery
