// SPDX-License-Identifier: Apache-2.0
#include "mprogressbar.h"

#include "pulse.h"
#include "theme.h"

namespace Mtk {
namespace Widget {

MProgressBar::MProgressBar(QWidget *parent)
    : QProgressBar(parent)
    , m_pulse(new Pulse(this))
{
    setAccessibleName(QStringLiteral("进度"));
}

MProgressBar::~MProgressBar() = default;

QSize MProgressBar::sizeHint() const
{
    const int height = isTextVisible() ? fontMetrics().height() : theme().progressHeight;
    return {theme().progressWidth, height};
}

void MProgressBar::paintEvent(QPaintEvent *event)
{
    m_pulse->setWanted(minimum() == maximum());
    QProgressBar::paintEvent(event);
}

} // namespace Widget
} // namespace Mtk
