// SPDX-License-Identifier: Apache-2.0
#include "writers.h"

#include "logtext.h"

#include <QJsonDocument>
#include <QJsonObject>

namespace {

constexpr int kVersion = 1;

// In the order of State.
constexpr const char *kNames[] = {"ok", "fault", "unknown", "none"};
constexpr const char *kMarks[] = {"[ ok ]", "[ !! ]", "[ ?? ]", "[    ]"};

// JSON need not escape these, but a terminal that it is shown on would obey them.
QByteArray withEscapedControls(const QByteArray &json)
{
    QString text;
    for (const QChar character : QString::fromUtf8(json)) {
        const bool isFormat = character == QLatin1Char('\n'); // in a string it is escaped already
        if (!isFormat && vesk::base::isControl(character.unicode()))
            text += QStringLiteral("\\u%1").arg(character.unicode(), 4, 16, QLatin1Char('0'));
        else
            text += character;
    }
    return text.toUtf8();
}

} // namespace

QString toText(const Findings &findings)
{
    QString text;
    for (const Finding &finding : findings) {
        text += QStringLiteral("%1 %2: %3\n")
                    .arg(QLatin1String(kMarks[int(finding.state)]), finding.key,
                         vesk::base::logText(finding.text));
        if (!finding.advice.isEmpty())
            text += QStringLiteral("       -> %1\n").arg(vesk::base::logText(finding.advice));
    }
    return text;
}

QByteArray toJson(const Findings &findings, int exitCode)
{
    QJsonObject all;
    for (const Finding &finding : findings)
        all.insert(finding.key,
                   QJsonObject{{QStringLiteral("state"), QLatin1String(kNames[int(finding.state)])},
                               {QStringLiteral("value"), finding.value},
                               {QStringLiteral("text"), finding.text},
                               {QStringLiteral("advice"), finding.advice}});
    return withEscapedControls(QJsonDocument(QJsonObject{{QStringLiteral("version"), kVersion},
                                                         {QStringLiteral("exit_code"), exitCode},
                                                         {QStringLiteral("findings"), all}})
                                   .toJson());
}
