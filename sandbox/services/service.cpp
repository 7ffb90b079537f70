// SPDX-License-Identifier: Apache-2.0
#include "service.h"

#include <QThread>

#include <unistd.h>

namespace sandbox {

Service::Service(StateFolder state, ServiceScript script, QString journalName)
    : m_state(std::move(state))
    , m_script(std::move(script))
    , m_journalName(std::move(journalName))
{
}

std::optional<QString> Service::enter(const QString &operation, const QString &call) const
{
    const ServiceScript now = m_script.operation(operation);
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

void Service::note(const QString &call, const QString &result) const
{
    const QString line = m_journalName + QLatin1Char(' ') + call;
    m_state.journal().write(QStringLiteral("bus"),
                            result.isEmpty() ? line : QStringLiteral("%1 -> %2").arg(line, result));
}

} // namespace sandbox
