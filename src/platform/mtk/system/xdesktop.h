// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QRegion>
#include <QSet>
#include <QString>

struct xcb_connection_t;

namespace Mtk {

// Asks the X server and its window manager directly, over a connection of the library's own that is opened on
// first use. Without an X server every answer is no, except that Wayland always composites windows.
class XDesktop
{
public:
    static XDesktop &instance();

    // Whether somebody has set the density of the screen, as desktops do for their scaling. Where nobody has,
    // X servers give one that comes from a size in whole millimeters, or from no size at all. May be called
    // before the application object.
    static bool isDensitySet();

    // Has the X server tell Qt's windows of the repeats of a key as presses without a release before each,
    // which is how they can be known from presses. Needs the application object.
    static void separateRepeats();

    // Scan codes of the keys that are down; none without an X server.
    QSet<quint32> keysDown();
    // Whether windows are composited, so that they may have translucent parts.
    bool isComposited();
    // Whether the window manager blurs what lies behind a window that asks for it.
    bool offersBlur();
    // Asks for blur behind `region`, in device pixels of the window; an empty region asks for none.
    void blurBehind(quint32 window, const QRegion &region);

private:
    XDesktop();
    ~XDesktop();
    Q_DISABLE_COPY(XDesktop)

    quint32 atom(const QByteArray &name, bool create = false);
    bool rootHasProperty(quint32 property);
    bool isSupported(quint32 property);

    xcb_connection_t *m_connection = nullptr;
    quint32 m_root = 0;
    int m_screen = 0;
};

} // namespace Mtk
