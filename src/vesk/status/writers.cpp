// SPDX-License-Identifier: Apache-2.0
#include "writers.h"

#include "logtext.h"

#include <QJsonDocument>
#include <QJsonObject>

namespace {

constexpr int kVersion = 1;

QString mark(State state)
{
    switch (state) {
    case State::Ok:
        return QStringLiteral("[ ok ]");
    case State::Fault:
        return QStringLiteral("[ !! ]");
    case State::Unknown:
        return QStringLiteral("[ ?? ]");
    case State::None:
        break;
    }
    return QStringLiteral("[    ]");
}

} // namespace

QString toText(const Findings &findings)
{
    QString text;
    for (const Finding &finding : findings) {
        text += QStringLiteral("%1 %2: %3\n")
                    .arg(mark(finding.state), finding.key, vesk::base::logText(finding.text));
        if (!finding.advice.isEmpty())
            text += QStringLiteral("       -> %1\n").arg(vesk::base::logText(finding.advice));
    }
    return text;
}

QByteArray toJson(const Findings &findings, int exitCode)
{
    QJsonObject all;
    for (const Finding &finding : findings)
        all.insert(finding.key, QJsonObject{{QStringLiteral("state"), nameOf(finding.state)},
                                            {QStringLiteral("value"), finding.value},
                                            {QStringLiteral("text"), finding.text},
                                            {QStringLiteral("advice"), finding.advice}});
    return QJsonDocument(QJsonObject{{QStringLiteral("version"), kVersion},
                                     {QStringLiteral("exit_code"), exitCode},
                                     {QStringLiteral("findings"), all}})
        .toJson();
}
