// SPDX-License-Identifier: Apache-2.0
#include "windowparts.h"

#include "mtk/mblureffectwidget.h"
#include "mtk/mtitlebar.h"
#include "mtk/mwindowmanagerhelper.h"

#include <QBoxLayout>

using Mtk::Gui::MWindowManagerHelper;
using Mtk::Widget::MBlurEffectWidget;
using Mtk::Widget::MTitlebar;

namespace windowparts {

namespace {

constexpr int kTitlebarHeight = 50;
constexpr unsigned char kOpaque = 255;

} // namespace

QIcon logo()
{
    return QIcon(QStringLiteral(":/images/logo.svg"));
}

QPalette backgroundPalette()
{
    QPalette palette;
    palette.setBrush(QPalette::All, QPalette::Window, QColor(247, 247, 247, 255));
    return palette;
}

MTitlebar *createTitlebar(QWidget *parent)
{
    auto *titlebar = new MTitlebar(parent);
    titlebar->setMenuVisible(false);
    titlebar->setWindowTitle(QString());
    titlebar->setIcon(logo());
    titlebar->setTitle(QString());
    titlebar->setFixedHeight(kTitlebarHeight);
    titlebar->setBackgroundTransparent(true);
    return titlebar;
}

void layOut(QWidget *window, MTitlebar *titlebar, QWidget *content)
{
    auto *layout = new QVBoxLayout;
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(titlebar);
    layout->addWidget(content);
    window->setLayout(layout);
    window->setContentsMargins(0, 0, 0, 0);
}

void makeOpaqueWithoutBlur(MBlurEffectWidget *window)
{
    if (!MWindowManagerHelper::instance()->hasBlurWindow())
        window->setMaskAlpha(kOpaque);
}

QSize windowSize(const QSize &page)
{
    return {page.width(), page.height() + kTitlebarHeight};
}

void setFixedWindowSize(QWidget *window, const QSize &size)
{
    window->setFixedSize(size);
    window->resize(size);
}

} // namespace windowparts
