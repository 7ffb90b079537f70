// SPDX-License-Identifier: Apache-2.0
#include "widgets/settingsitem.h"

#include "mtk/mframe.h"
#include "mtk/mstyle.h"

#include <QStyle>

using Mtk::Gui::MPalette;
using Mtk::Widget::MFrame;
using Mtk::Widget::MStyle;

namespace mcc::widgets {

namespace {
constexpr int kBackgroundRadius = 8;
}

SettingsItem::SettingsItem(QWidget *parent)
    : QFrame(parent)
{
}

void SettingsItem::setIsErr(bool err)
{
    if (err == m_isErr)
        return;
    m_isErr = err;
    style()->unpolish(this);
    style()->polish(this);
}

void SettingsItem::addBackground()
{
    if (m_bgGroup != nullptr)
        m_bgGroup->deleteLater();

    m_bgGroup = new MFrame(this);
    m_bgGroup->setBackgroundRole(MPalette::ItemBackground);
    m_bgGroup->setLineWidth(0);
    MStyle::setFrameRadius(m_bgGroup, kBackgroundRadius);
    m_bgGroup->lower();
    m_bgGroup->setFixedSize(size());
    // A row that is on the screen already shows no new child by itself.
    m_bgGroup->show();
}

void SettingsItem::resizeEvent(QResizeEvent *event)
{
    QFrame::resizeEvent(event);
    if (m_bgGroup != nullptr)
        m_bgGroup->setFixedSize(size());
}

} // namespace mcc::widgets
