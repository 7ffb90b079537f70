// SPDX-License-Identifier: Apache-2.0
#include "aliasrule.h"

#include "boundedmatch.h"
#include "logtext.h"

#include <QCoreApplication>
#include <QJsonDocument>
#include <QJsonObject>
#include <QVariant>

#include <QDebug>

using vesk::base::logText;

namespace aliasrule {

namespace {

QString notUnderstood()
{
    return QStringLiteral("域管服务配置失败，请重试");
}

// Reads a JSON object that must hold something. On failure `message` says why.
bool readObject(const QString &text, QJsonObject &object, QString &message)
{
    QJsonParseError error{};
    object = QJsonDocument::fromJson(text.toUtf8(), &error).object();
    if (error.error != QJsonParseError::NoError) {
        qWarning().noquote() << "invalid reply data, parse error: " << error.errorString();
        message = notUnderstood();
        return false;
    }
    if (object.isEmpty()) {
        message = QStringLiteral("服务端返回终端规则数据为空");
        return false;
    }
    return true;
}

// The same, and each of `keys` has to be there.
bool readObject(const QString &text, const QStringList &keys, QJsonObject &object, QString &message)
{
    if (!readObject(text, object, message))
        return false;
    for (const QString &key : keys) {
        if (!object.contains(key)) {
            message = notUnderstood();
            return false;
        }
    }
    return true;
}

// Servers may write a pattern between slashes.
QString withoutDelimiters(QString pattern)
{
    const QLatin1Char slash('/');
    if (pattern.startsWith(slash))
        pattern.remove(0, 1);
    if (pattern.endsWith(slash))
        pattern.chop(1);
    return pattern;
}

// The window stands still while a rule is tried. As during a call of the server, what the user does meanwhile
// is discarded: a second click on Next would otherwise hit the next page.
class BusySection
{
public:
    BusySection() { QCoreApplication::instance()->setProperty("busy", true); }
    ~BusySection()
    {
        QCoreApplication::processEvents();
        QCoreApplication::instance()->setProperty("busy", false);
    }
    Q_DISABLE_COPY_MOVE(BusySection)
};

BoundedMatch match(const QString &pattern, const QString &name)
{
    const BusySection busy;
    return matchInChild(pattern, name);
}

} // namespace

std::optional<QString> read(const QString &reply, QString &message)
{
    const QString messageKey = QStringLiteral("message");
    const QString ruleKey = QStringLiteral("regular_expression");
    QJsonObject envelope;
    if (!readObject(reply, {QStringLiteral("code"), messageKey}, envelope, message))
        return std::nullopt;
    // A JSON text within the JSON text.
    QJsonObject content;
    if (!readObject(envelope.value(messageKey).toString(), {ruleKey}, content, message))
        return std::nullopt;
    return content.value(ruleKey).toString();
}

bool isObeyed(const QString &rule, const QString &name, QString &message)
{
    const QString pattern = withoutDelimiters(rule);
    if (pattern.isEmpty())
        return false;
    qDebug() << "terminal Name Regular " << logText(pattern);
    const BoundedMatch result = match(pattern, name);
    if (result.verdict == BoundedMatch::Verdict::Undecided)
        qWarning().noquote() << "the alias rule counts as invalid:" << result.failure + QLatin1Char(';')
                             << "length of the rule:" << pattern.length();
    if (result.verdict == BoundedMatch::Verdict::Undecided ||
        result.verdict == BoundedMatch::Verdict::Invalid) {
        message = QStringLiteral("正则表达式不合法");
        return false;
    }
    const bool isMatch = result.verdict == BoundedMatch::Verdict::Match;
    if (isMatch)
        qInfo() << "满足部分==" << logText(name.mid(result.position, result.length));
    if (isMatch && result.length == name.length())
        return true;
    message = QStringLiteral("终端别名不符合正则安全规则!!");
    return false;
}

bool isAccepted(int statusCode, const QString &reply, QString &message)
{
    const QJsonObject verdict = QJsonDocument::fromJson(reply.toUtf8()).object();
    const QString codeKey = QStringLiteral("code");
    const QString messageKey = QStringLiteral("msg");
    if (statusCode != 200 || !verdict.contains(codeKey) || !verdict.contains(messageKey)) {
        message = notUnderstood();
        return false;
    }
    message = verdict.value(messageKey).toString();
    return verdict.value(codeKey).toInt(0) == 0;
}

} // namespace aliasrule
