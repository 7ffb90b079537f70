// SPDX-License-Identifier: Apache-2.0
// The rule for a terminal's alias, as a server may send it.
#include "httprequest.h"
#include "logcapture.h"
#include "replies.h"
#include "require.h"
#include "scriptedtransport.h"
#include "targets.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QRegExp>

namespace fuzz {

namespace {

constexpr int kAliasLength = 32; // the most that the page lets the user type

QString aliasOf(const QByteArray &part)
{
    return QString::fromUtf8(part).left(kAliasLength);
}

bool checkAlias(const QString &alias, const QVector<Reply> &replies, QString &message)
{
    scriptedtransport::script(replies);
    const bool accepted = HttpRequest::GetInstance()->checkPcName(alias, message);
    require(scriptedtransport::state().calls.size() <= 2, "at most two calls");
    return accepted;
}

// The reply of the rule endpoint: a JSON text within a JSON text.
Reply ruleReply(const QString &pattern)
{
    const QJsonObject rule{{QStringLiteral("regular_expression"), pattern}};
    const QJsonObject reply{{QStringLiteral("code"), 0},
                            {QStringLiteral("message"), QString::fromUtf8(QJsonDocument(rule).toJson())}};
    return {200, QString::fromUtf8(QJsonDocument(reply).toJson())};
}

// Whether `message` and `accepted` are what the expression class makes of alias and pattern.
bool isResultOf(const QString &pattern, const QString &alias, bool accepted, const QString &message)
{
    const QRegExp expression(pattern, Qt::CaseSensitive, QRegExp::RegExp);
    if (!expression.isValid())
        return message == QStringLiteral("正则表达式不合法");
    expression.indexIn(alias, 0, QRegExp::CaretAtZero);
    if (expression.matchedLength() != alias.length())
        return message == QStringLiteral("终端别名不符合正则安全规则!!");
    return accepted;
}

} // namespace

void aliasRule(const QByteArray &input)
{
    const QVector<Reply> replies = repliesOf(input, 1);
    QString message;
    const bool accepted = checkAlias(aliasOf(partsOf(input).first()), replies, message);
    if (accepted && scriptedtransport::state().calls.size() == 2)
        require(replies.value(1).status == 200, "the server accepts with status 200 only");
}

void aliasPattern(const QByteArray &input)
{
    const QVector<QByteArray> parts = partsOf(input);
    const QString pattern = QString::fromUtf8(parts.value(1));
    const QString alias = aliasOf(parts.first());
    QString message;
    const LogCapture log;
    const bool accepted = checkAlias(alias, {ruleReply(pattern)}, message);
    if (pattern.isEmpty()) {
        require(scriptedtransport::state().calls.size() == 2, "without a rule the server is asked");
        return;
    }
    require(scriptedtransport::state().calls.size() == 1, "with a rule the server is not asked");
    const bool isDelimitersOnly = pattern == QLatin1String("/") || pattern == QLatin1String("//");
    require(message.isEmpty() == (accepted || isDelimitersOnly), "a refusal has words");

    // What was decided within the limits is safe to do here.
    const bool isDelimited = pattern.startsWith(QLatin1Char('/')) || pattern.endsWith(QLatin1Char('/'));
    if (log.text().contains(QStringLiteral("counts as invalid")))
        require(message == QStringLiteral("正则表达式不合法"), "an undecided rule is an invalid one");
    else if (!isDelimited)
        require(isResultOf(pattern, alias, accepted, message),
                "a rule is what the expression class makes of it");
}

} // namespace fuzz
