// SPDX-License-Identifier: Apache-2.0
#include "screenshot.h"

#include "waitfor.h"

#include <QDir>
#include <QImage>

#include <memory>

#include <xcb/xcb.h>

namespace sandbox {

namespace {

constexpr int kStandstillMs = 1000; // a spinner never stands still
constexpr qreal kRounding = 3;      // pixels of the program, which tells whole ones of its own

template <typename Type>
using Reply = QScopedPointer<Type, QScopedPointerPodDeleter>; // ends in free()

// Whether a window of the display, in device pixels, is at `place`, whatever the program's scale factor is.
bool isAt(const QRect &window, const QRect &place)
{
    const qreal factor = qreal(window.width()) / place.width();
    const QPointF corner = QPointF(window.topLeft()) / factor - place.topLeft();
    return corner.manhattanLength() < kRounding &&
           qAbs(window.height() / factor - place.height()) < kRounding;
}

// The same part of the screen, where `place` is at `window`.
QRect onScreen(const QRect &window, const QRect &place, const QRect &whole)
{
    const qreal factor = qreal(window.width()) / place.width();
    const QPointF corner = window.topLeft() + QPointF(whole.topLeft() - place.topLeft()) * factor;
    return window.united(QRectF(corner, QSizeF(whole.size()) * factor).toRect());
}

// With the topmost such window. Null while there is none, or not all of it is on the screen.
QImage imageOf(xcb_connection_t *display, const Shot &shot)
{
    const xcb_window_t root = xcb_setup_roots_iterator(xcb_get_setup(display)).data->root;
    const Reply<xcb_query_tree_reply_t> tree(
        xcb_query_tree_reply(display, xcb_query_tree(display, root), nullptr));
    for (int i = tree ? tree->children_len : 0; i-- > 0;) {
        const auto window = xcb_get_geometry(display, xcb_query_tree_children(tree.get())[i]);
        const Reply<xcb_get_geometry_reply_t> at(xcb_get_geometry_reply(display, window, nullptr));
        if (!at || !isAt({at->x, at->y, at->width, at->height}, shot.window))
            continue;
        const QRect part = onScreen({at->x, at->y, at->width, at->height}, shot.window, shot.whole);
        const auto cookie =
            xcb_get_image(display, XCB_IMAGE_FORMAT_Z_PIXMAP, root, qint16(part.x()), qint16(part.y()),
                          quint16(part.width()), quint16(part.height()), ~0U);
        const Reply<xcb_get_image_reply_t> image(xcb_get_image_reply(display, cookie, nullptr));
        return image ? QImage(xcb_get_image_data(image.get()), part.width(), part.height(),
                              QImage::Format_RGB32)
                           .copy()
                     : QImage();
    }
    return {};
}

} // namespace

void saveScreenshot(const QString &directory, const QString &name, const std::function<Shot()> &shot)
{
    const std::unique_ptr<xcb_connection_t, decltype(&xcb_disconnect)> display(xcb_connect(nullptr, nullptr),
                                                                               &xcb_disconnect);
    if (xcb_connection_has_error(display.get()) != 0)
        throw Error(QStringLiteral("screenshots need the display of the program, but DISPLAY is \"%1\"")
                        .arg(qEnvironmentVariable("DISPLAY")));
    QImage now;
    QImage last;
    Shot where;
    for (const QDeadlineTimer limit(kStandstillMs); !limit.hasExpired(); QThread::msleep(kPollInterval)) {
        where = shot();
        now = where.window.isEmpty() ? QImage() : imageOf(display.get(), where);
        if (where.window.isEmpty() || (!now.isNull() && now == last))
            break;
        last = now.isNull() ? last : now;
    }
    if (now.isNull() && !where.window.isEmpty())
        throw Error(QStringLiteral("no window of the display is where the program has its %1").arg(name));
    const QString path = QStringLiteral("%1/%2.png").arg(directory, name);
    if (!last.isNull() && !(QDir().mkpath(directory) && last.save(path)))
        throw Error(QStringLiteral("cannot write the screenshot %1").arg(path));
}

} // namespace sandbox
