// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QProcess>

// An X server of the test's own, without a window manager, that ends with this object.
class XServer
{
public:
    XServer();
    ~XServer();
    Q_DISABLE_COPY(XServer)

    // Empty when the server didn't start.
    QByteArray display() const { return m_display; }

private:
    QProcess m_process;
    QByteArray m_display;
};
