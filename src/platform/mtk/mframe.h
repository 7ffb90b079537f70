// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mpalette.h"
#include "mtkglobal.h"

#include <QFrame>

namespace Mtk::Widget {

// A themed panel: without background until a role is set, with square corners until setFrameRounded() or
// MStyle::setFrameRadius() rounds them. With the shape HLine or VLine it is the theme's separator.
class MTK_EXPORT MFrame : public QFrame
{
    Q_OBJECT

public:
    explicit MFrame(QWidget *parent = nullptr);
    ~MFrame() override;

    using QFrame::setBackgroundRole;
    void setBackgroundRole(Gui::MPalette::ColorType type);
    // Corners of the theme's radius for panels, or square ones.
    void setFrameRounded(bool rounded);

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    Gui::MPalette::ColorType m_role = Gui::MPalette::NoType;
};

} // namespace Mtk::Widget
