// SPDX-License-Identifier: Apache-2.0
#include "service.h"

#include "data/data.h"
#include "journal/hold.h"

#include <QDBusConnectionInterface>

#include <unistd.h>

namespace sandbox {

namespace {

// An odd answer in place of the contract's.
QDBusMessage oddly(const QString &answer, const QDBusMessage &message, const QDBusMessage &right)
{
    if (answer == QLatin1String("nothing"))
        return message.createReply();
    const QVariant value = right.arguments().value(0);
    return message.createReply(value.type() == QVariant::String ? QVariant(7) : QVariant(value.toString()));
}

} // namespace

Service::Service(StateDirectory state, QJsonObject script, QString name, QString interface)
    : m_state(std::move(state))
    , m_script(std::move(script))
    , m_name(std::move(name))
    , m_interface(std::move(interface))
{
}

// The inner part of the contract's node.
QString Service::introspect(const QString & /*path*/) const
{
    const QString contract = QString::fromUtf8(data::read(qPrintable(m_interface + QStringLiteral(".xml"))));
    const auto begin = contract.indexOf(QLatin1String("<interface"));
    return contract.mid(begin, contract.indexOf(QLatin1String("</node>")) - begin);
}

bool Service::calls(const QDBusMessage &message, const char *method, const char *signature) const
{
    return message.interface() == m_interface && message.member() == QLatin1String(method) &&
           message.signature() == QLatin1String(signature);
}

bool Service::handleMessage(const QDBusMessage &message, const QDBusConnection &bus)
{
    const std::optional<Call> call = callIn(message);
    if (!call)
        return false;
    const QJsonObject script = nextScript(call->operation);
    waitAsScripted(m_state.journal(), QStringLiteral("bus"),
                   QStringLiteral("%1: \"%2\"").arg(m_name, call->operation),
                   json::number(script, "delay_ms", 0), json::flag(script, "hold"));
    if (json::flag(script, "vanish")) {
        note(*call, QStringLiteral("no reply, the service ends"));
        ::_exit(1);
    }
    if (const QString error = json::text(script, "error"); !error.isEmpty()) {
        note(*call, QStringLiteral("error %1").arg(error));
        return bus.send(message.createErrorReply(error, QStringLiteral("as the scenario says")));
    }
    const QDBusMessage answer = carryOut(*call, message, script);
    const QString odd = json::text(script, "answer");
    bus.send(odd.isEmpty() ? answer : oddly(odd, message, answer));
    if (json::flag(script, "ends") || json::flag(script, "restarts")) {
        bus.interface()->isServiceRegistered(bus.baseService()); // the bus answers in the order of the calls
        ::_exit(0);
    }
    return true;
}

QJsonObject Service::nextScript(const QString &operation)
{
    const QJsonValue own = json::object(m_script, "operations").value(operation);
    const QJsonObject script = own.isObject() ? own.toObject() : m_script;
    return ++m_calls[operation] > json::number(script, "good_calls", 0) ? script : QJsonObject();
}

void Service::note(const Call &call, const QString &result) const
{
    const QString line = m_name + QLatin1Char(' ') + call.text;
    m_state.journal().write(QStringLiteral("bus"),
                            result.isEmpty() ? line : QStringLiteral("%1 -> %2").arg(line, result));
}

} // namespace sandbox
