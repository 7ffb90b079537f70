// SPDX-License-Identifier: Apache-2.0
#include "service.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QThread>
#include <QTimer>

#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kFarewellMs = 100;

} // namespace

Service::Service(StateFolder state, ServiceScript script, QString journalName)
    : m_state(std::move(state))
    , m_script(std::move(script))
    , m_journalName(std::move(journalName))
{
}

ServiceScript Service::now(const QString &operation) const
{
    const ServiceScript script = m_script.operation(operation);
    return m_calls.value(operation) > script.spared ? script : ServiceScript();
}

std::optional<QString> Service::enter(const QString &operation, const QString &call)
{
    ++m_calls[operation];
    const ServiceScript now = this->now(operation);
    if (now.delayMs > 0)
        m_state.journal().write(
            QStringLiteral("bus"),
            QStringLiteral("%1: \"%2\" is held for %3 ms").arg(m_journalName, operation).arg(now.delayMs));
    QThread::msleep(static_cast<unsigned long>(now.delayMs));
    if (now.vanish) {
        note(call, QStringLiteral("no reply, the service ends"));
        ::_exit(1);
    }
    return now.error;
}

bool Service::begin(const QString &operation, const QString &call)
{
    const std::optional<QString> error = enter(operation, call);
    if (error) {
        note(call, QStringLiteral("error %1").arg(*error));
        sendErrorReply(*error, QStringLiteral("as the scenario wants it"));
    }
    return !error;
}

void Service::leave(const QString &operation, const QVariant &right)
{
    const ServiceScript now = this->now(operation);
    if (now.answer != OddAnswer::None) {
        setDelayedReply(true);
        QVariantList answer;
        if (now.answer == OddAnswer::WrongType)
            answer.append(right.type() == QVariant::String ? QVariant(7) : QVariant(right.toString()));
        connection().send(message().createReply(answer));
    }
    endIfScripted(operation);
}

// When the answer has gone out.
void Service::endIfScripted(const QString &operation)
{
    const ServiceScript now = this->now(operation);
    if (now.ends || now.restarts)
        QTimer::singleShot(kFarewellMs, this, [] { ::_exit(0); });
}

void Service::note(const QString &call, const QString &result) const
{
    const QString line = m_journalName + QLatin1Char(' ') + call;
    m_state.journal().write(QStringLiteral("bus"),
                            result.isEmpty() ? line : QStringLiteral("%1 -> %2").arg(line, result));
}

} // namespace sandbox
