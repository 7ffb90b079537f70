// SPDX-License-Identifier: Apache-2.0
#include "mframe.h"

#include "mstyle.h"
#include "style/looks.h"
#include "style/shapes.h"
#include "style/theme.h"

#include <QPainter>
#include <QVariant>

namespace Mtk::Widget {

namespace {

QColor colorOf(Gui::MPalette::ColorType type)
{
    switch (type) {
    case Gui::MPalette::ItemBackground:
        return theme().itemBackground;
    case Gui::MPalette::FrameShadowBorder:
        return theme().frameShadowBorder;
    case Gui::MPalette::NoType:
        break;
    }
    return Qt::transparent;
}

} // namespace

MFrame::MFrame(QWidget *parent)
    : QFrame(parent)
{
}

MFrame::~MFrame() = default;

void MFrame::setBackgroundRole(Gui::MPalette::ColorType type)
{
    m_role = type;
    update();
}

void MFrame::setFrameRounded(bool rounded)
{
    MStyle::setFrameRadius(this, rounded ? theme().panelRadius : 0);
}

void MFrame::paintEvent(QPaintEvent *event)
{
    if (m_role != Gui::MPalette::NoType) {
        QPainter painter(this);
        fillRounded(painter, rect(), property(Look::kRadius).toInt(), colorOf(m_role));
    }
    QFrame::paintEvent(event);
}

} // namespace Mtk::Widget
