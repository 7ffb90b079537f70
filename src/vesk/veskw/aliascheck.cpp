// SPDX-License-Identifier: Apache-2.0
// The two calls of HttpRequest that judge a terminal alias.
#include "httprequest.h"

#include "boundedmatch.h"
#include "fileconfig.h"
#include "httpclientapi.h"
#include "logtext.h"
#include "wellknownpaths.h"

#include <QCoreApplication>
#include <QJsonDocument>
#include <QJsonObject>
#include <QUrl>
#include <QVariant>

#include <QDebug>

using vesk::base::logText;

namespace {

QString notUnderstood()
{
    return QStringLiteral("域管服务配置失败，请重试");
}

QString notARule()
{
    return QStringLiteral("正则表达式不合法");
}

QString notObeyed()
{
    return QStringLiteral("终端别名不符合正则安全规则!!");
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

// The rule inside the reply of the rule endpoint: a JSON text within the JSON text.
bool readRule(const QString &reply, QString &rule, QString &message)
{
    const QString messageKey = QStringLiteral("message");
    const QString ruleKey = QStringLiteral("regular_expression");
    QJsonObject envelope;
    if (!readObject(reply, envelope, message))
        return false;
    if (!envelope.contains(QStringLiteral("code")) || !envelope.contains(messageKey)) {
        message = notUnderstood();
        return false;
    }
    QJsonObject content;
    if (!readObject(envelope.value(messageKey).toString(), content, message))
        return false;
    if (!content.contains(ruleKey)) {
        message = notUnderstood();
        return false;
    }
    rule = content.value(ruleKey).toString();
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
// is dropped: a second click on Next would otherwise hit the next page.
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

BoundedMatch tryRule(const QString &pattern, const QString &name)
{
    const BusySection busy;
    return matchInChild(pattern, name);
}

// The rule has to cover the whole alias, whether the pattern has anchors or not.
bool obeys(const QString &name, const QString &pattern, QString &message)
{
    qDebug() << "terminal Name Regular " << logText(pattern);
    const BoundedMatch match = tryRule(pattern, name);
    if (match.verdict == BoundedMatch::Verdict::Undecided)
        qWarning().noquote() << "the alias rule counts as invalid:" << match.failure + QLatin1Char(';')
                             << "length of the rule:" << pattern.length();
    switch (match.verdict) {
    case BoundedMatch::Verdict::Undecided:
    case BoundedMatch::Verdict::Invalid:
        message = notARule();
        return false;
    case BoundedMatch::Verdict::NoMatch:
        message = notObeyed();
        return false;
    case BoundedMatch::Verdict::Match:
        break;
    }
    qInfo() << "满足部分==" << logText(name.mid(match.position, match.length));
    if (match.length == name.length())
        return true;
    message = notObeyed();
    return false;
}

} // namespace

bool HttpRequest::checkPcName(const QString &name, QString &message)
{
    const QString url = QString::fromUtf8(vesk::KPCRegular).arg(m_host).arg(m_port);
    qInfo().noquote() << "------regularUrl-----:" << logText(url);
    QString reply;
    const int status = m_httpClient->getRequest(reply, url, QString(), true);
    qInfo() << "------initSshPort-------msg:" << logText(reply) << "code:" << status;

    QString rule;
    if (!readRule(reply, rule, message))
        return false;
    if (rule.isEmpty())
        return checkTerminalByServer(name, message);
    const QString pattern = withoutDelimiters(rule);
    return !pattern.isEmpty() && obeys(name, pattern, message);
}

bool HttpRequest::checkTerminalByServer(const QString &name, QString &message)
{
    const QUrl url = FileConfig::GetInstance()->getDomainUrl(QStringLiteral("/uim/v3/client/pc/verify/name"));
    qInfo() << "url===" << url;
    const QJsonObject body{{QStringLiteral("pc_name"), name}};
    QString reply;
    const int status = m_httpClient->getRequest(
        reply, url.url(), QString::fromUtf8(QJsonDocument(body).toJson().constData()), true);
    qDebug() << "check pc name result:" << status << logText(reply);
    if (status != 200) {
        message = notUnderstood();
        return false;
    }

    const QJsonObject verdict = QJsonDocument::fromJson(reply.toUtf8()).object();
    const QString codeKey = QStringLiteral("code");
    const QString messageKey = QStringLiteral("msg");
    if (!verdict.contains(codeKey) || !verdict.contains(messageKey)) {
        message = notUnderstood();
        return false;
    }
    message = verdict.value(messageKey).toString();
    return verdict.value(codeKey).toInt(0) == 0;
}
