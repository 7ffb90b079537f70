// SPDX-License-Identifier: Apache-2.0
#include "windowframe.h"

#include "style/shapes.h"
#include "style/theme.h"
#include "system/xdesktop.h"

#include <QEvent>
#include <QFocusFrame>
#include <QPainter>
#include <QPainterPath>
#include <QWidget>

namespace Mtk::WindowFrame {

namespace {

int radiusOf(const QWidget *window)
{
    const bool fills = window->isMaximized() || window->isFullScreen();
    return window->testAttribute(Qt::WA_TranslucentBackground) && !fills ? theme().windowRadius : 0;
}

// Lies over all that the window holds. Assistive technology, whose walks must not meet what comes and goes,
// leaves focus frames out.
class Shade : public QFocusFrame
{
public:
    explicit Shade(QWidget *window)
        : QFocusFrame(window)
    {
        setObjectName(QStringLiteral("shade"));
        resize(window->size());
        show();
    }

protected:
    void paintEvent(QPaintEvent * /*event*/) override
    {
        QPainter painter(this);
        fillRounded(painter, rect(), radiusOf(window()), theme().shade);
    }
};

} // namespace

void prepare(QWidget *window)
{
    if (XDesktop::instance().isComposited())
        window->setAttribute(Qt::WA_TranslucentBackground);
}

void paint(QWidget *window, const QColor &background)
{
    QPainter painter(window);
    const int radius = radiusOf(window);
    fillRounded(painter, window->rect(), radius, background);
    strokeRounded(painter, window->rect(), radius, theme().windowBorder, 1);
}

void shadeWhileBlocked(QWidget *window, const QEvent &event)
{
    const QEvent::Type type = event.type();
    if (type != QEvent::WindowBlocked && type != QEvent::WindowUnblocked && type != QEvent::Resize)
        return;
    auto *shade = window->findChild<QWidget *>(QStringLiteral("shade"), Qt::FindDirectChildrenOnly);
    if (type == QEvent::WindowBlocked && shade == nullptr)
        new Shade(window);
    else if (type == QEvent::WindowUnblocked)
        delete shade;
    else if (shade != nullptr)
        shade->resize(window->size());
}

QRegion covered(const QWidget *window)
{
    const qreal ratio = window->devicePixelRatioF();
    const QRectF device(QPointF(), QSizeF(window->size()) * ratio);
    const qreal radius = radiusOf(window) * ratio;
    QPainterPath path;
    path.addRoundedRect(device, radius, radius);
    return {path.toFillPolygon().toPolygon()};
}

} // namespace Mtk::WindowFrame
