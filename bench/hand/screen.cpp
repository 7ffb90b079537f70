// SPDX-License-Identifier: Apache-2.0
#include "screen.h"

#include <cstdlib>
#include <memory>

extern "C" {
#include <xdo.h>
}

namespace bench {

namespace {

template <typename Reply>
using Owned = std::unique_ptr<Reply, decltype(&std::free)>;

template <typename Reply>
Owned<Reply> owned(Reply *reply)
{
    return Owned<Reply>(reply, &std::free);
}

} // namespace

Screen::Screen()
    : m_connection(xcb_connect(nullptr, nullptr))
{
    if (!isConnected())
        return;
    m_root = xcb_setup_roots_iterator(xcb_get_setup(m_connection)).data->root;
    m_keyboard = xdo_new(nullptr);
}

Screen::~Screen()
{
    if (m_keyboard != nullptr)
        xdo_free(m_keyboard);
    xcb_disconnect(m_connection);
}

bool Screen::isConnected() const
{
    return xcb_connection_has_error(m_connection) == 0;
}

xcb_window_t Screen::topWindow() const
{
    const auto tree =
        owned(xcb_query_tree_reply(m_connection, xcb_query_tree(m_connection, m_root), nullptr));
    if (!tree)
        return 0;
    const xcb_window_t *windows = xcb_query_tree_children(tree.get());
    for (int index = xcb_query_tree_children_length(tree.get()) - 1; index >= 0; --index) {
        const auto attributes = owned(xcb_get_window_attributes_reply(
            m_connection, xcb_get_window_attributes(m_connection, windows[index]), nullptr));
        if (attributes && attributes->map_state == XCB_MAP_STATE_VIEWABLE)
            return windows[index];
    }
    return 0;
}

bool Screen::isPainted() const
{
    const xcb_window_t window = topWindow();
    const auto geometry =
        owned(xcb_get_geometry_reply(m_connection, xcb_get_geometry(m_connection, window), nullptr));
    if (window == 0 || !geometry)
        return false;
    const auto image =
        owned(xcb_get_image_reply(m_connection,
                                  xcb_get_image(m_connection, XCB_IMAGE_FORMAT_Z_PIXMAP, window, 0, 0,
                                                geometry->width, geometry->height, ~0U),
                                  nullptr));
    if (!image)
        return false;
    const auto *pixels = reinterpret_cast<const uint32_t *>(xcb_get_image_data(image.get()));
    const int count = xcb_get_image_data_length(image.get()) / 4;
    for (int index = 1; index < count; ++index) {
        if (pixels[index] != pixels[0])
            return true;
    }
    return false;
}

bool Screen::focusTopWindow()
{
    const xcb_window_t window = topWindow();
    if (window == 0)
        return false;
    xcb_set_input_focus(m_connection, XCB_INPUT_FOCUS_PARENT, window, XCB_CURRENT_TIME);
    // The keyboard has a connection of its own: what is typed next must find the focus there.
    return owned(xcb_get_input_focus_reply(m_connection, xcb_get_input_focus(m_connection), nullptr)) !=
           nullptr;
}

void Screen::type(const QString &text)
{
    xdo_enter_text_window(m_keyboard, CURRENTWINDOW, text.toLatin1().constData(), 0);
}

void Screen::press(const char *key)
{
    xdo_send_keysequence_window(m_keyboard, CURRENTWINDOW, key, 0);
}

} // namespace bench
