// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"

namespace sandbox {

// The accessibility bus of a session, with the switch on that makes programs publish their windows on it.
class Accessibility
{
public:
    explicit Accessibility(const QString &errorLog)
        : m_launcher(errorLog)
    {
    }

    // environment: of the session, its bus address included.
    bool start(const QProcessEnvironment &environment, QString *error);
    void stop() { m_launcher.end(); }

private:
    Child m_launcher;
};

} // namespace sandbox
