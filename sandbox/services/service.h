// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "scenario/json.h"
#include "state/statedirectory.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusVirtualObject>
#include <QMap>

#include <optional>

namespace sandbox {

// What the D-Bus services of a world share: each call is journalled together with its result, after the
// scenario had its way with it (a wait, an error, the end of the service in the middle of the call). Services
// keep their state in the state directory only, so a world can be stopped and started again.
class Service : public QDBusVirtualObject
{
public:
    // name: on the bus and in the journal. interface: the one that its contract is named after.
    Service(StateDirectory state, QJsonObject script, QString name, QString interface);

    // Publishes the object; the host takes the bus name afterwards. False when the bus refuses.
    bool publish(QDBusConnection bus) { return bus.registerVirtualObject(path(), this); }

    QString introspect(const QString &path) const override;
    bool handleMessage(const QDBusMessage &message, const QDBusConnection &bus) override;

protected:
    // A call that the contract has.
    struct Call
    {
        QString operation; // as scenarios name it
        QString text;      // as it stands in the journal: onDomainConfig("join")
    };

    // Whether the message calls this method of the interface, with arguments of this signature.
    bool calls(const QDBusMessage &message, const char *method, const char *signature) const;

    // Nothing where the message is no call of the contract; the bus then refuses it.
    virtual std::optional<Call> callIn(const QDBusMessage &message) const = 0;
    // Does the work of a call, journals it by note(), and gives the answer. script: what the scenario says
    // about this call.
    virtual QDBusMessage carryOut(const Call &call, const QDBusMessage &message,
                                  const QJsonObject &script) = 0;

    const StateDirectory &state() const { return m_state; }
    const QJsonObject &script() const { return m_script; } // of the service as a whole
    // Journals a call together with what came of it: `call -> result`, or the call alone.
    void note(const Call &call, const QString &result = {}) const;

private:
    // As the object's path is the service's name.
    QString path() const
    {
        return QLatin1Char('/') + QString(m_name).replace(QLatin1Char('.'), QLatin1Char('/'));
    }
    // Counts the call, and tells what the scenario says about it.
    QJsonObject nextScript(const QString &operation);

    StateDirectory m_state;
    QJsonObject m_script;
    QString m_name;
    QString m_interface;
    QMap<QString, int> m_calls; // so far, by operation
};

} // namespace sandbox
