// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"
#include "state/statedirectory.h"

namespace sandbox {

// A virtual screen for machines without a display. Only holders of its cookie may use it.
class Display
{
public:
    explicit Display(const StateDirectory &state)
        : m_state(state)
        , m_server(state.at("world.log"))
    {
    }

    void start(); // throws an Error
    void stop() { m_server.end(); }
    QString name() const { return m_name; } // as in DISPLAY
    // As in XAUTHORITY; in the world's runtime directory.
    QString authority() const { return m_state.run() + QStringLiteral("/xauthority"); }

private:
    void writeAuthority() const;

    StateDirectory m_state;
    QString m_name;
    Child m_server;
};

} // namespace sandbox
