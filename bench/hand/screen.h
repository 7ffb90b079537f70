// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

#include <xcb/xcb.h>

struct xdo;

namespace bench { // Xlib has a Screen, too

// The X display as a user has it before them: windows to look at, a keyboard to type on (extension XTEST).
// There is no window manager, so the hand gives the topmost window the focus itself. Names its display by
// DISPLAY.
class Screen
{
public:
    Screen();
    ~Screen();
    Screen(const Screen &) = delete;
    Screen &operator=(const Screen &) = delete;

    bool isConnected() const;

    // Whether the topmost window shows something: two colors at least.
    bool isPainted() const;

    // The focus goes to the topmost window that is mapped. False when there is none.
    bool focusTopWindow();

    // Types printable ASCII of the usual American layout.
    void type(const QString &text);
    void press(const char *key); // by the name of its keysym

private:
    xcb_window_t topWindow() const;

    xcb_connection_t *m_connection;
    xcb_window_t m_root = 0;
    xdo *m_keyboard = nullptr;
};

} // namespace bench
