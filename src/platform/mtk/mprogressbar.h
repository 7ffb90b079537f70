// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QProgressBar>

namespace Mtk::Widget {

class Pulse;

// A progress bar that looks like MSpinner. Values, range and text are QProgressBar's; with an empty range (0
// to 0) a part of the bar moves along it while it is visible.
class MTK_EXPORT MProgressBar : public QProgressBar
{
    Q_OBJECT

public:
    explicit MProgressBar(QWidget *parent = nullptr);
    ~MProgressBar() override;

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    Pulse *m_pulse;
};

} // namespace Mtk::Widget
