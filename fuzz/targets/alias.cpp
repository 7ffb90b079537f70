// SPDX-License-Identifier: Apache-2.0
// The rule for a terminal's alias, as a server may send it.
#include "httprequest.h"
#include "replies.h"
#include "require.h"
#include "scriptedtransport.h"
#include "targets.h"

#include <QJsonDocument>
#include <QJsonObject>

namespace fuzz {

namespace {

constexpr int kAliasLength = 32; // the most that the page lets the user type

QString aliasOf(const QByteArray &part)
{
    return QString::fromUtf8(part).left(kAliasLength);
}

bool judge(const QString &alias, const QVector<Reply> &replies, QString &message)
{
    scriptedtransport::script(replies);
    const bool accepted = HttpRequest::GetInstance()->checkPcName(alias, message);
    require(scriptedtransport::calls().size() <= 2, "at most two calls");
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

} // namespace

void aliasRule(const QByteArray &input)
{
    const QVector<Reply> replies = repliesOf(input, 1);
    QString message;
    const bool accepted = judge(aliasOf(partsOf(input).first()), replies, message);
    if (accepted && scriptedtransport::calls().size() == 2)
        require(replies.value(1).status == 200, "the server accepts with status 200 only");
}

void aliasPattern(const QByteArray &input)
{
    const QVector<QByteArray> parts = partsOf(input);
    const QString pattern = QString::fromUtf8(parts.value(1));
    QString message;
    const bool accepted = judge(aliasOf(parts.first()), {ruleReply(pattern)}, message);
    if (pattern.isEmpty()) {
        require(scriptedtransport::calls().size() == 2, "without a rule the server is asked");
        return;
    }
    require(scriptedtransport::calls().size() == 1, "with a rule the server is not asked");
    const bool isDelimitersOnly = pattern == QLatin1String("/") || pattern == QLatin1String("//");
    require(message.isEmpty() == (accepted || isDelimitersOnly), "a refusal has words");
}

} // namespace fuzz
