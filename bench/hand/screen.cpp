// SPDX-License-Identifier: Apache-2.0
#include "screen.h"

#include <xcb/xtest.h>

#include <cstdlib>
#include <memory>

namespace {

constexpr xcb_keysym_t kShift = 0xffe1;

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
    const xcb_setup_t *setup = xcb_get_setup(m_connection);
    m_root = xcb_setup_roots_iterator(setup).data->root;
    m_firstCode = setup->min_keycode;
    const auto count = static_cast<uint8_t>(setup->max_keycode - setup->min_keycode + 1);
    m_mapping = xcb_get_keyboard_mapping_reply(
        m_connection, xcb_get_keyboard_mapping(m_connection, m_firstCode, count), nullptr);
}

Screen::~Screen()
{
    std::free(m_mapping);
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
    xcb_flush(m_connection);
    return true;
}

void Screen::type(const QString &text)
{
    for (const QChar character : text)
        strike(character.unicode()); // the keysyms of ASCII are its codes
}

void Screen::press(xcb_keysym_t key)
{
    strike(key);
}

void Screen::strike(xcb_keysym_t key)
{
    const xcb_keysym_t *symbols = xcb_get_keyboard_mapping_keysyms(m_mapping);
    const int perCode = m_mapping->keysyms_per_keycode;
    const int count = xcb_get_keyboard_mapping_keysyms_length(m_mapping);
    xcb_keycode_t code = 0;
    xcb_keycode_t shift = 0;
    bool shifted = false;
    for (int index = 0; index < count; ++index) {
        const auto here = static_cast<xcb_keycode_t>(m_firstCode + index / perCode);
        if (symbols[index] == kShift && shift == 0)
            shift = here;
        if (symbols[index] == key && index % perCode < 2 && code == 0) {
            code = here;
            shifted = index % perCode == 1;
        }
    }
    if (shifted)
        send(shift, true);
    send(code, true);
    send(code, false);
    if (shifted)
        send(shift, false);
    xcb_flush(m_connection);
}

void Screen::send(xcb_keycode_t code, bool down)
{
    xcb_test_fake_input(m_connection, down ? XCB_KEY_PRESS : XCB_KEY_RELEASE, code, XCB_CURRENT_TIME, m_root,
                        0, 0, 0);
}
