// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QIcon>
#include <QPalette>
#include <QSize>

namespace Mtk::Widget {
class MBlurEffectWidget;
class MTitlebar;
} // namespace Mtk::Widget

// What the main window and the success window have in common: a titlebar over a page. Sizes are in
// device-independent pixels.
namespace windowparts {

QIcon logo();

// The background of a page and its window.
QPalette backgroundPalette();

// A titlebar of the standard height, with the logo and without texts and menu.
Mtk::Widget::MTitlebar *createTitlebar(QWidget *parent);

// Puts titlebar and content into `window`, from edge to edge.
void layOut(QWidget *window, Mtk::Widget::MTitlebar *titlebar, QWidget *content);

void makeOpaqueWithoutBlur(Mtk::Widget::MBlurEffectWidget *window);

// Of a window that holds a page of this size.
QSize windowSize(const QSize &page);

// At once, and for good.
void setFixedWindowSize(QWidget *window, const QSize &size);

} // namespace windowparts
