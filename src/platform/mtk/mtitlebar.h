// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QFrame>
#include <QIcon>
#include <QPointer>

namespace Mtk::Widget {

class GlyphButton;

// The bar on top of a window without a frame: icon, title, and the buttons that the flags of the window it
// stands in grant. Moves the window by the window system's own move, and maximises it on a double click where
// that is granted. Works in any window; never changes the window's flags.
class MTK_EXPORT MTitlebar : public QFrame
{
    Q_OBJECT

public:
    explicit MTitlebar(QWidget *parent = nullptr);
    ~MTitlebar() override;

    // The button that opens the window menu (minimise, maximise, close as granted). Shown by default.
    void setMenuVisible(bool visible);
    // Until this is called the bar shows the icon of its window. An empty icon shows none.
    void setIcon(const QIcon &icon);
    // Until this is called the bar shows the title of its window. Plain text, elided where it doesn't fit.
    void setTitle(const QString &title);
    // True lets the window show through; false, the default, fills the bar with the theme's color.
    void setBackgroundTransparent(bool transparent);

    QIcon icon() const;
    QString title() const;

    bool eventFilter(QObject *watched, QEvent *event) override;
    QSize sizeHint() const override;

protected:
    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
    void mousePressEvent(QMouseEvent *event) override;
    void mouseMoveEvent(QMouseEvent *event) override;
    void mouseReleaseEvent(QMouseEvent *event) override;
    void mouseDoubleClickEvent(QMouseEvent *event) override;

private:
    void followWindow();
    void updateButtons();
    bool grants(Qt::WindowFlags hint) const;
    bool mayMaximise() const;
    int firstButtonLeft() const;
    void openMenu();
    void minimise();
    void toggleMaximised();
    void closeWindow();

    GlyphButton *m_menuButton;
    GlyphButton *m_minimiseButton;
    GlyphButton *m_maximiseButton;
    GlyphButton *m_closeButton;
    QPointer<QWidget> m_followed; // the window whose flags, icon and title are shown
    QIcon m_icon;
    QString m_title;
    bool m_ownIcon = false;
    bool m_ownTitle = false;
    bool m_menuVisible = true;
    bool m_transparent = false;
    bool m_pressed = false;
    QPoint m_pressPosition; // relative to the window
};

} // namespace Mtk::Widget
