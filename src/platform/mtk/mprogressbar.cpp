// SPDX-License-Identifier: Apache-2.0
#include "mprogressbar.h"

#include "parts/pulse.h"
#include "style/looks.h"
#include "style/theme.h"

#include <QVariant>

namespace Mtk::Widget {

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
    const bool hasRange = minimum() != maximum();
    m_pulse->setWanted(!hasRange);
    if (!hasRange)
        setProperty(Look::kPhase, m_pulse->phase());
    QProgressBar::paintEvent(event);
}

} // namespace Mtk::Widget
