// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QAbstractButton>

class QVariantAnimation;

namespace Mtk::Widget {

// A two-state switch, toggled by click or Space; isChecked, setChecked and toggled are QAbstractButton's. It
// shows no text: callers give it an accessible name, usually that of the label beside it.
class MTK_EXPORT MSwitchButton : public QAbstractButton
{
    Q_OBJECT

public:
    explicit MSwitchButton(QWidget *parent = nullptr);
    ~MSwitchButton() override;

    QSize sizeHint() const override;

protected:
    void checkStateSet() override;
    void nextCheckState() override;
    void paintEvent(QPaintEvent *event) override;
    bool event(QEvent *event) override;

private:
    void slideKnob();

    QVariantAnimation *m_slide = nullptr; // null until the knob first moves while visible
    qreal m_knob = 0;                     // 0 off, 1 on, between while it moves
};

} // namespace Mtk::Widget
