// SPDX-License-Identifier: Apache-2.0
#include "play/windowmanager.h"

#include <QDeadlineTimer>
#include <QVector>

#include <cstring>
#include <memory>

#include <poll.h>
#include <xcb/xcb.h>

namespace sandbox {

namespace {

constexpr int kAnswerLimitMs = 5000;
constexpr char kPing[] = "_NET_WM_PING"; // sent back to the root window by whoever reads it

template <typename Type>
using Reply = QScopedPointer<Type, QScopedPointerPodDeleter>; // ends in free()

bool isShown(xcb_connection_t *connection, xcb_window_t window)
{
    const Reply<xcb_get_window_attributes_reply_t> attributes(
        xcb_get_window_attributes_reply(connection, xcb_get_window_attributes(connection, window), nullptr));
    return attributes && attributes->map_state == XCB_MAP_STATE_VIEWABLE;
}

xcb_atom_t atom(xcb_connection_t *connection, const char *name)
{
    const Reply<xcb_intern_atom_reply_t> reply(xcb_intern_atom_reply(
        connection, xcb_intern_atom(connection, 0, static_cast<uint16_t>(std::strlen(name)), name), nullptr));
    return reply ? reply->atom : static_cast<xcb_atom_t>(XCB_ATOM_NONE);
}

// Visible top-level windows that support WM_PROTOCOLS.
QVector<xcb_window_t> windowsOn(xcb_connection_t *connection, xcb_window_t root)
{
    QVector<xcb_window_t> result;
    const Reply<xcb_query_tree_reply_t> tree(
        xcb_query_tree_reply(connection, xcb_query_tree(connection, root), nullptr));
    const xcb_atom_t protocols = atom(connection, "WM_PROTOCOLS");
    for (int index = 0; tree && index < xcb_query_tree_children_length(tree.get()); ++index) {
        const xcb_window_t window = xcb_query_tree_children(tree.get())[index];
        const Reply<xcb_get_property_reply_t> property(xcb_get_property_reply(
            connection, xcb_get_property(connection, 0, window, protocols, XCB_ATOM_ATOM, 0, 1), nullptr));
        if (property && property->type == XCB_ATOM_ATOM && isShown(connection, window))
            result.append(window);
    }
    return result;
}

void tell(xcb_connection_t *connection, xcb_window_t window, xcb_atom_t protocol)
{
    xcb_client_message_event_t event = {};
    event.response_type = XCB_CLIENT_MESSAGE;
    event.format = 32;
    event.window = window;
    event.type = atom(connection, "WM_PROTOCOLS");
    event.data.data32[0] = protocol;
    event.data.data32[1] = XCB_CURRENT_TIME;
    event.data.data32[2] = window;
    xcb_send_event(connection, 0, window, XCB_EVENT_MASK_NO_EVENT, reinterpret_cast<const char *>(&event));
    xcb_flush(connection);
}

// A window that is gone has read it, too.
void awaitAnswer(xcb_connection_t *connection, xcb_window_t window)
{
    const xcb_atom_t ping = atom(connection, kPing);
    const QDeadlineTimer limit(kAnswerLimitMs);
    pollfd readable = {xcb_get_file_descriptor(connection), POLLIN, 0};
    while (!limit.hasExpired() && xcb_connection_has_error(connection) == 0) {
        const Reply<xcb_generic_event_t> event(xcb_poll_for_event(connection));
        if (!event) {
            ::poll(&readable, 1, static_cast<int>(limit.remainingTime()));
            continue;
        }
        const int type = event->response_type & 0x7f;
        if (type == XCB_CLIENT_MESSAGE) {
            const auto *message = reinterpret_cast<const xcb_client_message_event_t *>(event.get());
            if (message->data.data32[0] == ping && message->data.data32[2] == window)
                return;
        }
        if (type == XCB_UNMAP_NOTIFY &&
            reinterpret_cast<const xcb_unmap_notify_event_t *>(event.get())->window == window)
            return;
    }
}

} // namespace

int windowmanager::askToClose(const QProcessEnvironment &environment)
{
    qputenv("XAUTHORITY", environment.value(QStringLiteral("XAUTHORITY")).toLocal8Bit());
    const std::unique_ptr<xcb_connection_t, decltype(&xcb_disconnect)> connection(
        xcb_connect(environment.value(QStringLiteral("DISPLAY")).toLatin1().constData(), nullptr),
        xcb_disconnect);
    if (xcb_connection_has_error(connection.get()) != 0)
        return 0;
    const xcb_window_t root = xcb_setup_roots_iterator(xcb_get_setup(connection.get())).data->root;
    const uint32_t events = XCB_EVENT_MASK_SUBSTRUCTURE_NOTIFY;
    xcb_change_window_attributes(connection.get(), root, XCB_CW_EVENT_MASK, &events);
    const QVector<xcb_window_t> all = windowsOn(connection.get(), root);
    for (const xcb_window_t window : all) {
        tell(connection.get(), window, atom(connection.get(), "WM_DELETE_WINDOW"));
        tell(connection.get(), window, atom(connection.get(), kPing));
        awaitAnswer(connection.get(), window);
    }
    return all.size();
}

} // namespace sandbox
