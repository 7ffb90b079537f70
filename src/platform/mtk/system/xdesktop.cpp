// SPDX-License-Identifier: Apache-2.0
#include "xdesktop.h"

#include <QGuiApplication>
#include <QVector>

#include <qpa/qplatformnativeinterface.h>

#include <algorithm>
#include <cstdlib>
#include <memory>

#include <dlfcn.h>
#include <xcb/xcb.h>

namespace Mtk {

namespace {

constexpr char kBlurRegion[] = "_KDE_NET_WM_BLUR_BEHIND_REGION";
constexpr quint32 kMaxLength = 4096;     // of a list of atoms, in 32-bit words
constexpr quint32 kMaxResources = 65536; // likewise, of the desktop's settings

struct FreeReply
{
    void operator()(void *reply) const { std::free(reply); }
};

template <typename Reply>
using Owned = std::unique_ptr<Reply, FreeReply>;

quint32 rootOf(xcb_connection_t *connection, int screen)
{
    xcb_screen_iterator_t iterator = xcb_setup_roots_iterator(xcb_get_setup(connection));
    for (int i = 0; i < screen && iterator.rem > 1; ++i)
        xcb_screen_next(&iterator);
    return iterator.data->root;
}

bool contains(const void *list, int length, xcb_atom_t atom)
{
    const auto *atoms = static_cast<const xcb_atom_t *>(list);
    return std::find(atoms, atoms + length, atom) != atoms + length;
}

} // namespace

bool XDesktop::isDensitySet()
{
    if (qEnvironmentVariableIsSet("QT_FONT_DPI"))
        return true;
    const QByteArray platform = qgetenv("QT_QPA_PLATFORM");
    if (!platform.isEmpty() && !platform.startsWith("xcb"))
        return false;
    // Desktops on Wayland set it for their X server, which to ask might be to start.
    if (platform.isEmpty() && qEnvironmentVariableIsSet("WAYLAND_DISPLAY"))
        return true;
    const std::unique_ptr<xcb_connection_t, decltype(&xcb_disconnect)> connection(
        xcb_connect(nullptr, nullptr), &xcb_disconnect);
    if (xcb_connection_has_error(connection.get()))
        return false;
    const xcb_get_property_cookie_t cookie =
        xcb_get_property(connection.get(), 0, rootOf(connection.get(), 0), XCB_ATOM_RESOURCE_MANAGER,
                         XCB_ATOM_STRING, 0, kMaxResources);
    const Owned<xcb_get_property_reply_t> reply(xcb_get_property_reply(connection.get(), cookie, nullptr));
    if (!reply)
        return false;
    const auto *resources = static_cast<const char *>(xcb_get_property_value(reply.get()));
    return QByteArray::fromRawData(resources, xcb_get_property_value_length(reply.get()))
        .contains("Xft.dpi:");
}

// It is a matter of Qt's own connection, and of Xlib, which the platform plugin has loaded.
void XDesktop::separateRepeats()
{
    if (QGuiApplication::platformName() != QLatin1String("xcb"))
        return;
    void *display = QGuiApplication::platformNativeInterface()->nativeResourceForIntegration("display");
    void *xlib = dlopen("libX11.so.6", RTLD_LAZY | RTLD_NOLOAD);
    if (display == nullptr || xlib == nullptr)
        return;
    using Set = int (*)(void *display, int isWanted, int *isSupported);
    const auto set = reinterpret_cast<Set>(dlsym(xlib, "XkbSetDetectableAutoRepeat"));
    if (set != nullptr)
        set(display, 1, nullptr);
    dlclose(xlib);
}

XDesktop &XDesktop::instance()
{
    static XDesktop desktop;
    return desktop;
}

XDesktop::XDesktop()
{
    if (QGuiApplication::platformName() != QLatin1String("xcb"))
        return;
    xcb_connection_t *connection = xcb_connect(nullptr, &m_screen);
    if (xcb_connection_has_error(connection)) {
        xcb_disconnect(connection);
        return;
    }
    m_connection = connection;
    m_root = rootOf(connection, m_screen);
}

XDesktop::~XDesktop()
{
    if (m_connection)
        xcb_disconnect(m_connection);
}

QSet<quint32> XDesktop::keysDown()
{
    QSet<quint32> result;
    if (m_connection == nullptr)
        return result;
    const Owned<xcb_query_keymap_reply_t> reply(
        xcb_query_keymap_reply(m_connection, xcb_query_keymap(m_connection), nullptr));
    for (quint32 code = 0; reply && code < 8 * sizeof reply->keys; ++code) {
        if ((reply->keys[code / 8] >> (code % 8) & 1) != 0)
            result.insert(code);
    }
    return result;
}

bool XDesktop::isComposited()
{
    if (QGuiApplication::platformName().startsWith(QLatin1String("wayland")))
        return true;
    const quint32 selection = m_connection ? atom("_NET_WM_CM_S" + QByteArray::number(m_screen)) : XCB_NONE;
    if (selection == XCB_NONE)
        return false;
    const xcb_get_selection_owner_cookie_t cookie = xcb_get_selection_owner(m_connection, selection);
    const Owned<xcb_get_selection_owner_reply_t> reply(
        xcb_get_selection_owner_reply(m_connection, cookie, nullptr));
    return reply && reply->owner != XCB_NONE;
}

bool XDesktop::offersBlur()
{
    const quint32 property = m_connection ? atom(kBlurRegion) : XCB_NONE;
    return property != XCB_NONE && (rootHasProperty(property) || isSupported(property)) && isComposited();
}

void XDesktop::blurBehind(quint32 window, const QRegion &region)
{
    const quint32 property = m_connection ? atom(kBlurRegion, true) : XCB_NONE;
    if (property == XCB_NONE)
        return;
    QVector<quint32> boxes;
    for (const QRect &box : region)
        boxes << quint32(box.x()) << quint32(box.y()) << quint32(box.width()) << quint32(box.height());
    if (boxes.isEmpty())
        xcb_delete_property(m_connection, window, property);
    else
        xcb_change_property(m_connection, XCB_PROP_MODE_REPLACE, window, property, XCB_ATOM_CARDINAL, 32,
                            quint32(boxes.size()), boxes.constData());
    xcb_flush(m_connection);
}

// XCB_NONE if nobody has created it yet, which means that nobody supports it.
quint32 XDesktop::atom(const QByteArray &name, bool create)
{
    const xcb_intern_atom_cookie_t cookie =
        xcb_intern_atom(m_connection, create ? 0 : 1, quint16(name.size()), name.constData());
    const Owned<xcb_intern_atom_reply_t> reply(xcb_intern_atom_reply(m_connection, cookie, nullptr));
    return reply ? reply->atom : quint32(XCB_NONE);
}

bool XDesktop::rootHasProperty(quint32 property)
{
    const xcb_list_properties_cookie_t cookie = xcb_list_properties(m_connection, m_root);
    const Owned<xcb_list_properties_reply_t> reply(xcb_list_properties_reply(m_connection, cookie, nullptr));
    if (!reply)
        return false;
    return contains(xcb_list_properties_atoms(reply.get()), xcb_list_properties_atoms_length(reply.get()),
                    property);
}

bool XDesktop::isSupported(quint32 property)
{
    const quint32 list = atom("_NET_SUPPORTED");
    if (list == XCB_NONE)
        return false;
    const xcb_get_property_cookie_t cookie =
        xcb_get_property(m_connection, 0, m_root, list, XCB_ATOM_ATOM, 0, kMaxLength);
    const Owned<xcb_get_property_reply_t> reply(xcb_get_property_reply(m_connection, cookie, nullptr));
    if (!reply || reply->format != 32)
        return false;
    return contains(xcb_get_property_value(reply.get()), int(reply->value_len), property);
}

} // namespace Mtk
