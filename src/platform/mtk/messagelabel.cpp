// SPDX-License-Identifier: Apache-2.0
#include "messagelabel.h"

#include <QPainter>
#include <QStyle>
#include <QTextLayout>

#include <cmath>

namespace Mtk {
namespace Widget {

namespace {

// Line ends as QTextLayout knows them.
QString layoutText(QString text)
{
    text.replace(QLatin1String("\r\n"), QLatin1String("\n"));
    return text.replace(QLatin1Char('\n'), QChar::LineSeparator);
}

} // namespace

MessageLabel::MessageLabel(QWidget *parent)
    : QLabel(parent)
{
    setTextFormat(Qt::PlainText);
    setAlignment(Qt::AlignHCenter);
    QSizePolicy policy(QSizePolicy::Expanding, QSizePolicy::Minimum);
    policy.setHeightForWidth(true);
    setSizePolicy(policy);
}

MessageLabel::~MessageLabel() = default;

QSize MessageLabel::sizeHint() const
{
    const int width = naturalWidth();
    return {width, heightForWidth(width)};
}

QSize MessageLabel::minimumSizeHint() const
{
    return {fontMetrics().maxWidth(), fontMetrics().lineSpacing()};
}

int MessageLabel::heightForWidth(int width) const
{
    if (text().isEmpty())
        return 0;
    QTextLayout layout(layoutText(text()), font());
    return int(std::ceil(breakLines(layout, width)));
}

int MessageLabel::naturalWidth() const
{
    QTextLayout layout(layoutText(text()), font());
    breakLines(layout, QWIDGETSIZE_MAX);
    return int(std::ceil(layout.maximumWidth()));
}

void MessageLabel::paintEvent(QPaintEvent * /*event*/)
{
    QTextLayout layout(layoutText(text()), font());
    breakLines(layout, width());
    QPainter painter(this);
    painter.setPen(palette().color(foregroundRole()));
    layout.draw(&painter, QPointF());
}

// Returns the height of all lines.
qreal MessageLabel::breakLines(QTextLayout &layout, qreal width) const
{
    const bool runsOn = width < QWIDGETSIZE_MAX && naturalWidth() > width;
    // Lines that run on read better from a straight left edge.
    QTextOption option(runsOn ? Qt::AlignLeft : alignment());
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    layout.setTextOption(option);
    qreal height = 0;
    layout.beginLayout();
    for (QTextLine line = layout.createLine(); line.isValid(); line = layout.createLine()) {
        line.setLineWidth(width);
        line.setPosition({0, height});
        height += line.height();
    }
    layout.endLayout();
    return height;
}

} // namespace Widget
} // namespace Mtk
