// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QProcessEnvironment>
#include <QVector>

#include <xcb/xcb.h>

namespace sandbox {

// Plays the window manager's part on a display that has none: asks windows to close. For a display that one
// program has for itself.
class WindowManager
{
public:
    // environment: names display and cookie; this process takes the cookie over.
    explicit WindowManager(const QProcessEnvironment &environment);
    ~WindowManager();
    Q_DISABLE_COPY_MOVE(WindowManager)

    // Asks every window that shows to close, as a press of the button in its frame does, and waits until each
    // has read that, or a limit of some seconds where the program does not read. Returns how many there were.
    int askToClose();

private:
    QVector<xcb_window_t> windows() const;
    xcb_atom_t atom(const char *name) const;
    void tell(xcb_window_t window, xcb_atom_t protocol) const;
    void awaitAnswer(xcb_window_t window) const;

    xcb_connection_t *m_connection;
    xcb_window_t m_root = 0;
};

} // namespace sandbox
