// SPDX-License-Identifier: Apache-2.0
#include "dialogicon.h"

#include "style/theme.h"

#include <QPainter>

namespace Mtk::Widget {

DialogIcon::DialogIcon(QWidget *parent)
    : QWidget(parent)
{
    setFixedSize(theme().dialogIcon, theme().dialogIcon);
    hide();
}

void DialogIcon::setIcon(const QIcon &icon)
{
    m_icon = icon;
    setVisible(!icon.isNull());
    update();
}

void DialogIcon::paintEvent(QPaintEvent * /*event*/)
{
    QPainter painter(this);
    m_icon.paint(&painter, rect());
}

} // namespace Mtk::Widget
