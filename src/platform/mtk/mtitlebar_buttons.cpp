// SPDX-License-Identifier: Apache-2.0
// The window buttons of the bar, their menu, and what they do to the window.
#include "mtitlebar.h"

#include "parts/glyphbutton.h"
#include "style/theme.h"

#include <QMenu>

namespace Mtk::Widget {

void MTitlebar::updateButtons()
{
    const bool maximised = window()->isMaximized();
    m_menuButton->setVisible(m_menuVisible && grants(Qt::WindowSystemMenuHint));
    m_minimiseButton->setVisible(grants(Qt::WindowMinimizeButtonHint));
    m_maximiseButton->setVisible(mayMaximise());
    m_maximiseButton->setGlyph(maximised ? Glyph::Restore : Glyph::Maximise,
                               maximised ? QStringLiteral("还原") : QStringLiteral("最大化"));
    m_closeButton->setVisible(grants(Qt::WindowCloseButtonHint));
    update();
}

bool MTitlebar::grants(Qt::WindowFlags hint) const
{
    return window()->windowFlags() & hint;
}

bool MTitlebar::mayMaximise() const
{
    return grants(Qt::WindowMaximizeButtonHint) && window()->minimumSize() != window()->maximumSize();
}

int MTitlebar::firstButtonLeft() const
{
    for (const GlyphButton *button : {m_menuButton, m_minimiseButton, m_maximiseButton, m_closeButton}) {
        if (button->isVisibleTo(this))
            return button->x();
    }
    return width() - theme().titlebarPadding;
}

void MTitlebar::openMenu()
{
    auto *menu = new QMenu(this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    if (grants(Qt::WindowMinimizeButtonHint))
        menu->addAction(m_minimiseButton->accessibleName(), this, &MTitlebar::minimise);
    if (mayMaximise())
        menu->addAction(m_maximiseButton->accessibleName(), this, &MTitlebar::toggleMaximised);
    if (grants(Qt::WindowCloseButtonHint))
        menu->addAction(m_closeButton->accessibleName(), this, &MTitlebar::closeWindow);
    menu->popup(m_menuButton->mapToGlobal({0, m_menuButton->height()}));
}

void MTitlebar::minimise()
{
    window()->showMinimized();
}

void MTitlebar::toggleMaximised()
{
    window()->setWindowState(window()->windowState() ^ Qt::WindowMaximized);
}

void MTitlebar::closeWindow()
{
    window()->close();
}

} // namespace Mtk::Widget
