// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

#include <QDBusConnection>
#include <QDBusContext>
#include <QObject>
#include <QVariant>

namespace sandbox {

// What the D-Bus services of a world share: each call is journalled together with its result, after the//
// scenario had its way with it (a wait, an error, the end of the service in the middle of the call). Services
// keep their state in the state directory only, so a world can be stopped and started again.
class Service : public QObject, protected QDBusContext
{
    Q_OBJECT

public:
    // Publishes the object; the host takes the bus name afterwards. False when the bus refuses.
    virtual bool publish(QDBusConnection bus) { return bus.registerObject(path(), this); }

protected:
    // name: on the bus and in the journal.
    Service(StateDirectory state, QJsonObject script, QString name);

    // As the object's path is the service's name.
    QString path() const
    {
        return QLatin1Char('/') + QString(m_name).replace(QLatin1Char('.'), QLatin1Char('/'));
    }
    const StateDirectory &state() const { return m_state; }
    const QJsonObject &script() const { return m_script; }
    // What the scenario says about the call of this operation that is in progress.
    QJsonObject now(const QString &operation) const;

    // Goes through the scenario's part of a call: waits, may end the process. call: as it stands in the
    // journal, onDomainConfig("join"). The name of the error to answer with when the call is not to be
    // carried out.
    std::optional<QString> enter(const QString &operation, const QString &call);

    // enter() for methods of adaptors: sends the error itself, then false.
    bool begin(const QString &operation, const QString &call);
    // After the call was carried out: an odd answer in place of the contract's, and the end of the service,
    // where the scenario wants them. `right` is of the contract's type.
    void leave(const QString &operation, const QVariant &right);
    // The second half of leave() alone: once the answer has gone out on this bus.
    void endIfScripted(const QString &operation, const QDBusConnection &bus);
    // Journals a call together with what came of it: `call -> result`, or the call alone.
    void note(const QString &call, const QString &result = {}) const;

private:
    StateDirectory m_state;
    QJsonObject m_script;
    QString m_name;
    QMap<QString, int> m_calls; // by operation, the present one included
};

} // namespace sandbox
