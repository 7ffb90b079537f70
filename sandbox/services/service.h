// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "world/statefolder.h"

#include <QDBusConnection>
#include <QDBusContext>
#include <QObject>

namespace sandbox {

// What the D-Bus services of a world share: each call is journalled together with its result, after the
// scenario had its way with it (a wait, an error, the end of the service in the middle of the call). Services
// keep their state in the state folder only, so a world can be stopped and started again.
class Service : public QObject, protected QDBusContext
{
    Q_OBJECT

public:
    // Publishes the object; the host takes the bus name afterwards. False when the bus refuses.
    virtual bool publish(QDBusConnection bus) = 0;

protected:
    Service(StateFolder state, ServiceScript script, QString journalName);

    const StateFolder &state() const { return m_state; }
    const ServiceScript &script() const { return m_script; }

    // Goes through the scenario's part of a call: waits, may end the process. call: as it stands in the
    // journal, onDomainConfig("join"). The name of the error to answer with when the call is not to be
    // carried out.
    std::optional<QString> enter(const QString &operation, const QString &call) const;

    // enter() for methods of adaptors: sends the error itself, then false.
    bool begin(const QString &operation, const QString &call);
    // Journals a call together with what came of it: `call -> result`, or the call alone.
    void note(const QString &call, const QString &result = {}) const;

private:
    StateFolder m_state;
    ServiceScript m_script;
    QString m_journalName;
};

} // namespace sandbox
