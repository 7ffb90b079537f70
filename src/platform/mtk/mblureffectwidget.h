// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QWidget>

namespace Mtk::Widget {

// A top-level window that draws its own thin frame, with rounded corners where the desktop composites
// windows, and a background that lets the blurred desktop through where the window manager offers blur.
// Programs derive their main window from it and put an MTitlebar on top, which carries the buttons that the
// window's flags grant. It is darkened while a modal window blocks it. A new window is frameless and has the
// hints for title, system menu, minimise, maximise and close; programs remove hints with
// setWindowFlags(windowFlags() & ~hint). Its edges offer no resizing. To assistive technology it is a window;
// without a title and an accessible name it is named after the application.
class MTK_EXPORT MBlurEffectWidget : public QWidget
{
    Q_OBJECT
    Q_PROPERTY(int maskAlpha READ maskAlpha)

public:
    explicit MBlurEffectWidget(QWidget *parent = nullptr);
    ~MBlurEffectWidget() override;

    // Opacity of the background, 0 (clear) to 255 (opaque). Without a compositor windows are always opaque.
    void setMaskAlpha(unsigned char alpha);
    int maskAlpha() const { return m_maskAlpha; }

protected:
    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
    void showEvent(QShowEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;
    void changeEvent(QEvent *event) override;

private:
    void requestBlur();

    unsigned char m_maskAlpha;
};

} // namespace Mtk::Widget
