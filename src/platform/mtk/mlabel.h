// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mobject.h"
#include "mtkglobal.h"

#include <QLabel>

namespace Mtk::Widget {

// A label in the theme's font. Shows plain text unless setTextFormat() says otherwise, so that what a server
// or a user wrote is not taken for markup.
class MTK_EXPORT MLabel : public QLabel, public Core::MObject
{
    Q_OBJECT

public:
    explicit MLabel(QWidget *parent = nullptr, Qt::WindowFlags flags = {});
    ~MLabel() override;

    // Where an ellipsis stands for what a plain text is too long to show; a text that wraps past the label's
    // height is shown on one line then. Qt::ElideNone, the default, cuts the text off. text() and what a
    // screen reader hears stay whole, and while text is left out the whole is the label's tool tip.
    void setElideMode(Qt::TextElideMode mode);

protected:
    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
};

} // namespace Mtk::Widget
