// SPDX-License-Identifier: Apache-2.0
#include "callreport.h"

#include <QDebug>

namespace {

QString cause(const ExchangeOutcome &outcome, const SslConfiguration &configuration)
{
    switch (outcome.culprit) {
    case ExchangeOutcome::Culprit::CaFile:
        return QStringLiteral("CA file %1: %2").arg(configuration.caFile(), outcome.failure);
    case ExchangeOutcome::Culprit::ClientPair:
        return QStringLiteral("client certificate %1: %2")
            .arg(configuration.certificateFile(), outcome.failure);
    case ExchangeOutcome::Culprit::Peer:
        return QStringLiteral("the server's certificate does not pass under CA file %1: %2")
            .arg(configuration.caFile(), outcome.failure);
    case ExchangeOutcome::Culprit::Other:
        break;
    }
    return outcome.failure;
}

QString answer(const ExchangeOutcome &outcome)
{
    QString text = QStringLiteral("answered with status %1").arg(outcome.status);
    if (!outcome.failure.isEmpty())
        return text + QStringLiteral(", reply unusable: ") + outcome.failure;
    if (outcome.status < 400)
        return text + QStringLiteral(": redirects are not followed");
    return text;
}

} // namespace

CallReport::CallReport(const char *method, const QString &address)
    : m_call(QString::fromLatin1(method) + QLatin1Char(' ') + address)
{
}

void CallReport::refused(const QString &reason) const
{
    qWarning().noquote() << m_call + QStringLiteral(": nothing was sent: ") + reason;
}

void CallReport::firstContact(const QString &fingerprint) const
{
    qWarning().noquote() << m_call +
                                QStringLiteral(": first contact, the server is not verified, SHA-256 of its "
                                               "certificate ") +
                                fingerprint;
}

void CallReport::ended(const ExchangeOutcome &outcome, const SslConfiguration &configuration) const
{
    if (outcome.failure.isEmpty() && outcome.status < 300)
        return;
    switch (outcome.stage) {
    case ExchangeOutcome::Stage::NothingSent:
        refused(cause(outcome, configuration));
        return;
    case ExchangeOutcome::Stage::Sent:
        qWarning().noquote() << m_call + QStringLiteral(": sent, outcome unknown: ") + outcome.failure;
        return;
    case ExchangeOutcome::Stage::Answered:
        qWarning().noquote() << m_call + QStringLiteral(": ") + answer(outcome);
        return;
    }
}
