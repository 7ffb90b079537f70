// SPDX-License-Identifier: Apache-2.0
#include "service.h"

#include "journal/hold.h"

#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QTimer>

#include <unistd.h>

namespace sandbox {

namespace {

// The bus answers in the order of the calls.
void leaveBus(const QDBusConnection &bus)
{
    bus.interface()->isServiceRegistered(bus.baseService());
    ::_exit(0);
}

} // namespace

Service::Service(StateDirectory state, QJsonObject script, QString name)
    : m_state(std::move(state))
    , m_script(std::move(script))
    , m_name(std::move(name))
{
}

QJsonObject Service::now(const QString &operation) const
{
    const QJsonValue own = json::object(m_script, "operations").value(operation);
    const QJsonObject script = own.isObject() ? own.toObject() : m_script;
    return m_calls.value(operation) > json::number(script, "good_calls", 0) ? script : QJsonObject();
}

std::optional<QString> Service::enter(const QString &operation, const QString &call)
{
    ++m_calls[operation];
    const QJsonObject now = this->now(operation);
    waitAsScripted(m_state.journal(), QStringLiteral("bus"),
                   QStringLiteral("%1: \"%2\"").arg(m_name, operation), json::number(now, "delay_ms", 0),
                   json::flag(now, "hold"));
    if (json::flag(now, "vanish")) {
        note(call, QStringLiteral("no reply, the service ends"));
        ::_exit(1);
    }
    return now.contains(QLatin1String("error")) ? std::optional(json::text(now, "error")) : std::nullopt;
}

bool Service::begin(const QString &operation, const QString &call)
{
    const std::optional<QString> error = enter(operation, call);
    if (error) {
        note(call, QStringLiteral("error %1").arg(*error));
        sendErrorReply(*error, QStringLiteral("as the scenario says"));
    }
    return !error;
}

void Service::leave(const QString &operation, const QVariant &right)
{
    const QJsonObject now = this->now(operation);
    const QString odd = json::text(now, "answer");
    if (!odd.isEmpty()) {
        setDelayedReply(true);
        QVariantList answer;
        if (odd == QLatin1String("wrong-type"))
            answer.append(right.type() == QVariant::String ? QVariant(7) : QVariant(right.toString()));
        connection().send(message().createReply(answer));
    }
    endIfScripted(operation, connection());
}

void Service::endIfScripted(const QString &operation, const QDBusConnection &bus)
{
    const QJsonObject now = this->now(operation);
    if (json::flag(now, "ends") || json::flag(now, "restarts"))
        QTimer::singleShot(0, this, [bus] { leaveBus(bus); });
}

void Service::note(const QString &call, const QString &result) const
{
    const QString line = m_name + QLatin1Char(' ') + call;
    m_state.journal().write(QStringLiteral("bus"),
                            result.isEmpty() ? line : QStringLiteral("%1 -> %2").arg(line, result));
}

} // namespace sandbox
