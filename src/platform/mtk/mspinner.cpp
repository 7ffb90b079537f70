// SPDX-License-Identifier: Apache-2.0
#include "mspinner.h"

#include "parts/pulse.h"
#include "style/theme.h"

#include <QAccessibleWidget>
#include <QPainter>

namespace Mtk::Widget {

namespace {

constexpr qreal kLineWidth = 0.125; // of the side
constexpr int kSixteenths = 16;     // QPainter counts angles in sixteenths of a degree
constexpr int kTop = 90;
constexpr int kTurn = 360;
constexpr int kArc = 100;

QAccessibleInterface *spinnerInterface(const QString & /*className*/, QObject *object)
{
    auto *spinner = qobject_cast<MSpinner *>(object);
    return spinner ? new QAccessibleWidget(spinner, QAccessible::Animation) : nullptr;
}

} // namespace

MSpinner::MSpinner(QWidget *parent)
    : QWidget(parent)
    , m_pulse(new Pulse(this))
{
    QAccessible::installFactory(spinnerInterface);
    setAccessibleName(QStringLiteral("正在处理"));
}

MSpinner::~MSpinner() = default;

QSize MSpinner::sizeHint() const
{
    return {theme().spinner, theme().spinner};
}

bool MSpinner::isPlaying() const
{
    return m_pulse->isRunning();
}

void MSpinner::start()
{
    m_pulse->setWanted(true);
}

void MSpinner::stop()
{
    m_pulse->setWanted(false);
}

void MSpinner::paintEvent(QPaintEvent * /*event*/)
{
    const qreal side = qMin(width(), height());
    const qreal line = side * kLineWidth;
    QRectF circle(0, 0, side - line, side - line);
    circle.moveCenter(QRectF(rect()).center());
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(theme().track, line));
    painter.drawEllipse(circle);
    painter.setPen(
        QPen(isEnabled() ? theme().accent : theme().accentDisabled, line, Qt::SolidLine, Qt::RoundCap));
    const int start = kTop - qRound(m_pulse->phase() * kTurn);
    painter.drawArc(circle, start * kSixteenths, -kArc * kSixteenths);
}

} // namespace Mtk::Widget
