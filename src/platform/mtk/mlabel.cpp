// SPDX-License-Identifier: Apache-2.0
#include "mlabel.h"

#include "style/looks.h"

#include <QHelpEvent>
#include <QPainter>
#include <QStyle>
#include <QTextDocument>
#include <QToolTip>
#include <QVariant>

namespace Mtk::Widget {

namespace {

Qt::TextElideMode elideModeOf(const QLabel &label)
{
    const QVariant mode = label.property(Look::kElideMode);
    return mode.isValid() ? Qt::TextElideMode(mode.toInt()) : Qt::ElideNone;
}

bool leavesOut(const QLabel &label)
{
    if (elideModeOf(label) == Qt::ElideNone || label.textFormat() != Qt::PlainText)
        return false;
    return label.wordWrap() ? label.heightForWidth(label.width()) > label.height()
                            : label.sizeHint().width() > label.width();
}

} // namespace

MLabel::MLabel(QWidget *parent, Qt::WindowFlags flags)
    : QLabel(parent, flags)
{
    setTextFormat(Qt::PlainText);
}

MLabel::~MLabel() = default;

void MLabel::setElideMode(Qt::TextElideMode mode)
{
    setProperty(Look::kElideMode, mode);
    update();
}

bool MLabel::event(QEvent *event)
{
    if (event->type() != QEvent::ToolTip || !toolTip().isEmpty() || !leavesOut(*this))
        return QLabel::event(event);
    // A tool tip would take the text for markup where it looks like that.
    QToolTip::showText(static_cast<QHelpEvent *>(event)->globalPos(), Qt::convertFromPlainText(text()), this);
    return true;
}

void MLabel::paintEvent(QPaintEvent *event)
{
    if (!leavesOut(*this)) {
        QLabel::paintEvent(event);
        return;
    }
    QPainter painter(this);
    drawFrame(&painter);
    const QRect place = contentsRect().adjusted(margin(), margin(), -margin(), -margin());
    const QString shown = fontMetrics().elidedText(text(), elideModeOf(*this), place.width());
    style()->drawItemText(&painter, place, int(alignment()), palette(), isEnabled(), shown, foregroundRole());
}

} // namespace Mtk::Widget
