// SPDX-License-Identifier: Apache-2.0
#include "mtitlebar.h"

#include "parts/glyphbutton.h"
#include "style/theme.h"

#include <QApplication>
#include <QHBoxLayout>
#include <QMouseEvent>
#include <QPainter>
#include <QWindow>

namespace Mtk::Widget {

namespace {

GlyphButton *titleButton(Glyph glyph, const QString &name, QWidget *bar)
{
    auto *button = new GlyphButton(glyph, name, bar);
    button->setFixedSize(theme().titleButton, theme().titleButton);
    bar->layout()->addWidget(button);
    return button;
}

} // namespace

MTitlebar::MTitlebar(QWidget *parent)
    : QFrame(parent)
{
    auto *row = new QHBoxLayout(this);
    row->setContentsMargins(theme().titlebarPadding, 0, theme().titlebarPadding, 0);
    row->setSpacing(0);
    row->addStretch();
    m_menuButton = titleButton(Glyph::Menu, QStringLiteral("菜单"), this);
    m_minimiseButton = titleButton(Glyph::Minimise, QStringLiteral("最小化"), this);
    m_maximiseButton = titleButton(Glyph::Maximise, QString(), this); // named by updateButtons()
    m_closeButton = titleButton(Glyph::Close, QStringLiteral("关闭"), this);
    m_closeButton->setDestructive(true);
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);

    connect(m_menuButton, &GlyphButton::clicked, this, &MTitlebar::openMenu);
    connect(m_minimiseButton, &GlyphButton::clicked, this, &MTitlebar::minimise);
    connect(m_maximiseButton, &GlyphButton::clicked, this, &MTitlebar::toggleMaximised);
    connect(m_closeButton, &GlyphButton::clicked, this, &MTitlebar::closeWindow);
}

MTitlebar::~MTitlebar() = default;

void MTitlebar::setMenuVisible(bool visible)
{
    m_menuVisible = visible;
    updateButtons();
}

void MTitlebar::setIcon(const QIcon &icon)
{
    m_icon = icon;
    m_ownIcon = true;
    update();
}

void MTitlebar::setTitle(const QString &title)
{
    m_title = title;
    m_ownTitle = true;
    update();
}

void MTitlebar::setBackgroundTransparent(bool transparent)
{
    m_transparent = transparent;
    update();
}

QIcon MTitlebar::icon() const
{
    return m_ownIcon ? m_icon : window()->windowIcon();
}

QString MTitlebar::title() const
{
    return m_ownTitle ? m_title : window()->windowTitle();
}

QSize MTitlebar::sizeHint() const
{
    return {QFrame::sizeHint().width(), theme().titlebarHeight};
}

bool MTitlebar::event(QEvent *event)
{
    if (event->type() == QEvent::Polish || event->type() == QEvent::Show)
        followWindow();
    return QFrame::event(event);
}

bool MTitlebar::eventFilter(QObject *watched, QEvent *event)
{
    switch (event->type()) {
    case QEvent::Show:
    case QEvent::WindowStateChange:
        updateButtons();
        break;
    case QEvent::WindowTitleChange:
    case QEvent::WindowIconChange:
        update();
        break;
    default:
        break;
    }
    return QFrame::eventFilter(watched, event);
}

void MTitlebar::followWindow()
{
    if (m_followed != window()) {
        if (m_followed)
            m_followed->removeEventFilter(this);
        m_followed = window();
        m_followed->installEventFilter(this);
    }
    updateButtons();
}

void MTitlebar::paintEvent(QPaintEvent * /*event*/)
{
    const Theme &t = theme();
    QPainter painter(this);
    if (!m_transparent)
        painter.fillRect(rect(), t.titlebar);
    QRect rest(t.titlebarPadding, 0, firstButtonLeft() - t.titlebarPadding - t.titlebarSpacing, height());
    const QIcon shownIcon = icon();
    if (!shownIcon.isNull()) {
        const QRect place(rest.x(), (height() - t.titleIcon) / 2, t.titleIcon, t.titleIcon);
        shownIcon.paint(&painter, place);
        rest.setLeft(place.right() + 1 + t.titlebarSpacing);
    }
    painter.setPen(isActiveWindow() ? t.text : t.textMuted);
    const QString shownTitle = fontMetrics().elidedText(title(), Qt::ElideRight, rest.width());
    painter.drawText(rest, int(Qt::AlignVCenter | Qt::AlignLeft) | Qt::TextSingleLine, shownTitle);
}

void MTitlebar::mousePressEvent(QMouseEvent *event)
{
    m_pressed = event->button() == Qt::LeftButton;
    m_pressPosition = event->globalPos() - window()->pos();
}

void MTitlebar::mouseMoveEvent(QMouseEvent *event)
{
    const QPoint moved = event->globalPos() - window()->pos() - m_pressPosition;
    if (!m_pressed || moved.manhattanLength() < QApplication::startDragDistance() || window()->isMaximized())
        return;
    QWindow *handle = window()->windowHandle();
    if (handle && handle->startSystemMove())
        m_pressed = false; // the window system takes the rest of this press
    else
        window()->move(event->globalPos() - m_pressPosition); // no window manager
}

void MTitlebar::mouseReleaseEvent(QMouseEvent * /*event*/)
{
    m_pressed = false;
}

void MTitlebar::mouseDoubleClickEvent(QMouseEvent *event)
{
    m_pressed = false;
    if (event->button() == Qt::LeftButton && mayMaximise())
        toggleMaximised();
}

} // namespace Mtk::Widget
