// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "child.h"

namespace sandbox {

// The launcher of the accessibility bus starts a bus daemon, which would outlive it.
class GuardedChild : public Child
{
    Q_OBJECT

public:
    using Child::Child;

protected:
    void setupChildProcess() override;
};

// The accessibility bus of a session, with the switch on that makes programs publish their windows on it.
class Accessibility
{
public:
    explicit Accessibility(const QString &errorLog)
        : m_launcher(errorLog)
    {
    }

    // environment: of the session, its bus address included. Throws an Error.
    void start(const QProcessEnvironment &environment);
    void stop() { m_launcher.end(); }
    // Of the accessibility bus itself, once started.
    QString address() const { return m_address; }

private:
    GuardedChild m_launcher;
    QString m_address;
};

} // namespace sandbox
