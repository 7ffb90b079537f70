// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QWidget>

namespace Mtk::Widget {

class Pulse;

// A turning arc for work of unknown length. Turns only while started and visible: a hidden spinner costs
// nothing, and goes on when it is shown again.
class MTK_EXPORT MSpinner : public QWidget
{
    Q_OBJECT

public:
    explicit MSpinner(QWidget *parent = nullptr);
    ~MSpinner() override;

    QSize sizeHint() const override;
    // Whether it is started and visible.
    bool isPlaying() const;

public Q_SLOTS:
    void start();
    void stop();

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    Pulse *m_pulse;
};

} // namespace Mtk::Widget
