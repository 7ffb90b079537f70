// SPDX-License-Identifier: Apache-2.0
#include "display.h"

#include "trouble.h"

#include <xcb/xcb.h>

#include <cstdlib>
#include <cstring>
#include <memory>

namespace sandbox {

namespace {

struct Release
{
    void operator()(xcb_connection_t *connection) const { xcb_disconnect(connection); }
    void operator()(void *reply) const { std::free(reply); }
};
using Connection = std::unique_ptr<xcb_connection_t, Release>;

template <typename Reply>
using Owned = std::unique_ptr<Reply, Release>;

Connection connectToDisplay()
{
    Connection connection(xcb_connect(nullptr, nullptr));
    if (xcb_connection_has_error(connection.get()) != 0)
        return nullptr;
    return connection;
}

xcb_atom_t atomOf(xcb_connection_t *connection, const char *name)
{
    const auto cookie = xcb_intern_atom(connection, 0, static_cast<uint16_t>(std::strlen(name)), name);
    const Owned<xcb_intern_atom_reply_t> reply(xcb_intern_atom_reply(connection, cookie, nullptr));
    return reply ? reply->atom : xcb_atom_t(XCB_ATOM_NONE);
}

bool writeOnRoot(xcb_connection_t *connection, const QByteArray &text)
{
    const xcb_window_t root = xcb_setup_roots_iterator(xcb_get_setup(connection)).data->root;
    const auto cookie =
        xcb_change_property_checked(connection, XCB_PROP_MODE_REPLACE, root, atomOf(connection, "AT_SPI_BUS"),
                                    XCB_ATOM_STRING, 8, static_cast<uint32_t>(text.size()), text.constData());
    const Owned<xcb_generic_error_t> error(xcb_request_check(connection, cookie));
    return !error && xcb_connection_has_error(connection) == 0;
}

} // namespace

bool canReachDisplay()
{
    return connectToDisplay() != nullptr;
}

void nameBusOnDisplay(const QString &address)
{
    const Connection connection = connectToDisplay();
    if (!connection || !writeOnRoot(connection.get(), address.toUtf8())) {
        throw Trouble(
            QStringLiteral("cannot write to the display \"%1\"").arg(qEnvironmentVariable("DISPLAY")));
    }
}

} // namespace sandbox
