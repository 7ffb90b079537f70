// SPDX-License-Identifier: Apache-2.0
#include "marrowrectangle.h"

#include "mwindowmanagerhelper.h"
#include "style/theme.h"

#include <QBitmap>
#include <QEvent>
#include <QGuiApplication>
#include <QPainter>
#include <QScreen>

#include <algorithm>
#include <functional>

namespace Mtk::Widget {

namespace {

constexpr qreal kHalfLine = 0.5; // keeps the border inside the window

QRect screenAround(const QPoint &place)
{
    const QScreen *screen = QGuiApplication::screenAt(place);
    return (screen ? screen : QGuiApplication::primaryScreen())->availableGeometry();
}

// Where a body of `length` starts so that the tip at `tip` stands `inset` from its beginning, or further
// along where the screen ends.
int bodyStart(int tip, int length, int inset, int screenStart, int screenEnd)
{
    return qMax(screenStart, qMin(tip - inset, screenEnd - length));
}

// Where the edge that carries the arrow lies: its x on the left and the right, its y otherwise.
qreal edge(const QRectF &rect, MArrowRectangle::ArrowDirection direction)
{
    if (direction == MArrowRectangle::ArrowLeft || direction == MArrowRectangle::ArrowRight)
        return direction == MArrowRectangle::ArrowLeft ? rect.left() : rect.right();
    return direction == MArrowRectangle::ArrowTop ? rect.top() : rect.bottom();
}

} // namespace

MArrowRectangle::MArrowRectangle(ArrowDirection direction, QWidget *parent)
    : QWidget(parent, Qt::ToolTip | Qt::FramelessWindowHint)
    , m_direction(direction)
{
    setAttribute(Qt::WA_ShowWithoutActivating);
    if (Gui::MWindowManagerHelper::instance()->hasComposite())
        setAttribute(Qt::WA_TranslucentBackground);
}

MArrowRectangle::~MArrowRectangle() = default;

void MArrowRectangle::setContent(QWidget *content)
{
    if (content == m_content)
        return;
    delete m_content;
    m_content = content;
    if (!content)
        return;
    content->setParent(this);
    content->show();
    resizeWithContent();
}

void MArrowRectangle::resizeWithContent()
{
    if (!m_content)
        return;
    m_content->adjustSize();
    const QMargins margins = bodyMargins();
    resize(m_content->size().grownBy(margins));
    m_content->move(margins.left(), margins.top());
    updateShape();
}

void MArrowRectangle::show(int x, int y)
{
    ensurePolished();
    resizeWithContent();
    const QRect area = screenAround({x, y});
    const int inset = qMin(theme().arrowInset, (isHorizontal() ? height() : width()) / 2);
    QPoint corner(m_direction == ArrowRight ? x - width() : x, m_direction == ArrowBottom ? y - height() : y);
    if (isHorizontal())
        corner.setY(bodyStart(y, height(), inset, area.top(), area.bottom() + 1));
    else
        corner.setX(bodyStart(x, width(), inset, area.left(), area.right() + 1));
    m_tipOffset = isHorizontal() ? y - corner.y() : x - corner.x();
    move(corner);
    updateShape();
    QWidget::show();
}

bool MArrowRectangle::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::Hide)
        hide();
    return QWidget::eventFilter(watched, event);
}

void MArrowRectangle::paintEvent(QPaintEvent * /*event*/)
{
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(theme().windowBorder, 1));
    painter.setBrush(theme().surface);
    painter.drawPath(outline());
}

void MArrowRectangle::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (parentWidget())
        parentWidget()->window()->installEventFilter(this);
}

void MArrowRectangle::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    updateShape();
}

// The arrow stands on the left or the right edge.
bool MArrowRectangle::isHorizontal() const
{
    return m_direction == ArrowLeft || m_direction == ArrowRight;
}

QMargins MArrowRectangle::bodyMargins() const
{
    const int around = theme().popupPadding;
    const int arrow = theme().arrowLength + around;
    return {m_direction == ArrowLeft ? arrow : around, m_direction == ArrowTop ? arrow : around,
            m_direction == ArrowRight ? arrow : around, m_direction == ArrowBottom ? arrow : around};
}

QPainterPath MArrowRectangle::outline() const
{
    const Theme &t = theme();
    const QRectF whole = QRectF(rect()).adjusted(kHalfLine, kHalfLine, -kHalfLine, -kHalfLine);
    const QRectF body = whole.marginsRemoved(QMarginsF(bodyMargins()) - qreal(t.popupPadding));
    const qreal half = t.arrowWidth / 2.0;
    const qreal first = t.panelRadius + half;
    const qreal last = (isHorizontal() ? body.height() : body.width()) - first;
    const qreal tip = qBound(first, qreal(m_tipOffset), qMax(first, last));
    const qreal base = edge(body.adjusted(1, 1, -1, -1), m_direction);

    QPolygonF triangle({{tip - half, base}, {tip, edge(whole, m_direction)}, {tip + half, base}});
    if (isHorizontal())
        std::transform(triangle.begin(), triangle.end(), triangle.begin(), std::mem_fn(&QPointF::transposed));
    QPainterPath outline;
    outline.addRoundedRect(body, t.panelRadius, t.panelRadius);
    QPainterPath arrow;
    arrow.addPolygon(triangle);
    arrow.closeSubpath();
    return outline.united(arrow);
}

// Without a compositor the window itself is cut to the outline.
void MArrowRectangle::updateShape()
{
    if (testAttribute(Qt::WA_TranslucentBackground))
        return;
    QBitmap mask(size());
    mask.clear();
    QPainter painter(&mask);
    painter.setPen(QPen(Qt::color1, 1));
    painter.setBrush(Qt::color1);
    painter.drawPath(outline());
    painter.end();
    setMask(mask);
}

} // namespace Mtk::Widget
