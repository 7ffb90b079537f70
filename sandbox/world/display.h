// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"

namespace sandbox {

// A virtual screen for machines without a display.
class Display
{
public:
    explicit Display(const QString &errorLog)
        : m_server(errorLog)
    {
    }

    bool start(QString *error);
    void stop() { m_server.end(); }
    QString name() const { return m_name; } // as in DISPLAY

private:
    QString m_name;
    Child m_server;
};

} // namespace sandbox
