// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QFrame>
#include <QIcon>
#include <QPointer>

class QLabel;

namespace Mtk {
namespace Widget {

class GlyphButton;

// The bar on top of a window without a frame: icon, title, and the buttons that the flags of the window it
// stands in grant. Moves the window by the window system's own move, and maximises on a double click where
// that is granted. Works in any window; never changes the window's flags.
class MTK_EXPORT MTitlebar : public QFrame
{
    Q_OBJECT

public:
    explicit MTitlebar(QWidget *parent = nullptr);
    ~MTitlebar() override;

    // The button that opens the window menu (minimise, maximise, close as granted). Shown by default.
    void setMenuVisible(bool visible);
    // An empty icon shows none.
    void setIcon(const QIcon &icon);
    // Until this is called the bar shows the title of its window. Shown as plain text.
    void setTitle(const QString &title);
    // True lets the window show through; false, the default, draws a bar of its own.
    void setBackgroundTransparent(bool transparent);

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
    GlyphButton *addButton(const char *objectName, const QString &accessibleName,
                           void (MTitlebar::*pressed)());
    void followWindow();
    void updateButtons();
    void updateTitle();
    void updateIcon();
    bool mayMaximise() const;
    void openMenu();
    void minimise();
    void toggleMaximised();
    void closeWindow();

    QLabel *m_iconLabel;
    QLabel *m_titleLabel;
    GlyphButton *m_menuButton;
    GlyphButton *m_minimiseButton;
    GlyphButton *m_maximiseButton;
    GlyphButton *m_closeButton;
    QPointer<QWidget> m_followed; // the window whose flags and title are shown
    QIcon m_icon;
    bool m_menuVisible = true;
    bool m_ownTitle = false;
    bool m_transparent = false;
    bool m_pressed = false;
    QPoint m_pressPosition; // where a press went down, relative to the window
};

} // namespace Widget
} // namespace Mtk
