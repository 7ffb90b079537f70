// SPDX-License-Identifier: Apache-2.0
#include "callreport.h"

#include <QDebug>

#include <algorithm>

namespace {

// Characters that would start another line, steer a terminal or turn the direction of writing.
bool isUnprintable(QChar character)
{
    const QChar::Category category = character.category();
    return category == QChar::Other_Control || category == QChar::Other_Format ||
           category == QChar::Separator_Line || category == QChar::Separator_Paragraph;
}

QString cause(const ExchangeOutcome &outcome, const SslConfiguration &configuration)
{
    switch (outcome.source) {
    case ExchangeOutcome::FailureSource::CaFile:
        return QStringLiteral("CA file %1: %2").arg(configuration.caFile(), outcome.failure);
    case ExchangeOutcome::FailureSource::ClientPair:
        return QStringLiteral("client certificate %1: %2")
            .arg(configuration.certificateFile(), outcome.failure);
    case ExchangeOutcome::FailureSource::Peer:
        return QStringLiteral("the server's certificate does not pass under CA file %1: %2")
            .arg(configuration.caFile(), outcome.failure);
    case ExchangeOutcome::FailureSource::Other:
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
    : m_call(QString::fromLatin1(method) + QLatin1Char(' ') + address + QStringLiteral(": "))
{
}

void CallReport::refused(const QString &reason) const
{
    warn(QStringLiteral("nothing was sent: ") + reason);
}

void CallReport::ended(const ExchangeOutcome &outcome, const SslConfiguration &configuration) const
{
    if (!outcome.peerFingerprint.isEmpty())
        warn(QStringLiteral("first contact, the server is not verified, SHA-256 of its certificate ") +
             outcome.peerFingerprint);
    if (outcome.failure.isEmpty() && outcome.status < 300)
        return;
    switch (outcome.stage) {
    case ExchangeOutcome::Stage::NothingSent:
        refused(cause(outcome, configuration));
        return;
    case ExchangeOutcome::Stage::Sent:
        warn(QStringLiteral("sent, outcome unknown: ") + outcome.failure);
        return;
    case ExchangeOutcome::Stage::Answered:
        warn(answer(outcome));
        return;
    }
}

void CallReport::warn(const QString &text) const
{
    QString line = m_call + text;
    std::replace_if(line.begin(), line.end(), isUnprintable, QChar(QChar::ReplacementCharacter));
    qWarning().noquote() << line;
}
