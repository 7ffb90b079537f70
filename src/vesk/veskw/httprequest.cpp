// SPDX-License-Identifier: Apache-2.0
#include "httprequest.h"

#include "aliasrule.h"
#include "fileconfig.h"
#include "filecontent.h"
#include "httpclientapi.h"
#include "logtext.h"
#include "serverreply.h"
#include "wellknownpaths.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QUrl>
#include <QUrlQuery>

#include <QDebug>

#include <type_traits>

#include <string.h>

using vesk::base::logText;

namespace {

// A join that the server has begun must not be given up lightly.
constexpr int kReplyTimerMinutes = 2;

// Of HTTP: from the first to before the second, a request has succeeded.
constexpr int kFirstSuccess = 200;
constexpr int kFirstRedirect = 300;

QString machineId()
{
    return vesk::base::FileContent::instace()->getMachineID(nullptr, false);
}

// Not through data(), which would overwrite a copy of what is shared.
template <typename Text>
void overwrite(const Text &text)
{
    const auto *characters = text.constData();
    ::explicit_bzero(
        const_cast<std::remove_const_t<std::remove_pointer_t<decltype(characters)>> *>(characters),
        static_cast<size_t>(text.size()) * sizeof *characters);
}

QString bodyText(const QJsonObject &body)
{
    const QByteArray json = QJsonDocument(body).toJson();
    QString text = QString::fromUtf8(json.constData());
    overwrite(json);
    return text;
}

// An unusable URL stays one: setting its query would clear the error and let the call go to another port.
void addQuery(QUrl &url, const QUrlQuery &query)
{
    if (url.isValid())
        url.setQuery(query);
}

// The transport warns of every other status. The server's words are for the user: what was typed may stand in
// them.
void warnUnlessGood(const QUrl &url, int status, const ServerReply &reply, bool (ServerReply::*isYes)() const)
{
    if (status < kFirstSuccess || status >= kFirstRedirect)
        return;
    const QString answer = logText(url.toString(QUrl::RemoveUserInfo | QUrl::RemoveQuery)) +
                           QStringLiteral(": answered with status %1, ").arg(status);
    if (!reply.isJson())
        qWarning().noquote() << answer + QStringLiteral("but not with JSON");
    else if (!(reply.*isYes)())
        qWarning().noquote() << answer + QStringLiteral("taken as a refusal, code %1").arg(reply.code());
}

} // namespace

HttpRequest::HttpRequest()
    : QObject(nullptr)
    , m_httpClient(new HttpClientApi(this, false))
{
    m_httpClient->setReplyTimer(kReplyTimerMinutes);
    setSSLConfig(QString::fromUtf8(vesk::kServerCertPath), QString::fromUtf8(vesk::kPublicKeyPath),
                 QString::fromUtf8(vesk::kPrivateKeyPath));
}

HttpRequest *HttpRequest::GetInstance()
{
    static HttpRequest instance;
    return &instance;
}

void HttpRequest::setSSLConfig(const QString &caPath, const QString &certPath, const QString &keyPath)
{
    m_httpClient->setSSLConfig(caPath, certPath, keyPath);
}

QString HttpRequest::exchange(Request request, const QUrl &url, const QString &body, Report report, Yes isYes)
{
    QString reply;
    const int status = (m_httpClient->*request)(reply, url.url(), body, true);
    overwrite(body);
    warnUnlessGood(url, status, ServerReply(reply), isYes);
    (this->*report)(status, reply);
    return reply;
}

void HttpRequest::getCaCert(const QString &host, const QString &port)
{
    m_host = host;
    m_port = port;
    // By hand: the address is not stored before the server there has answered.
    QUrl url;
    url.setScheme(QStringLiteral("https"));
    url.setHost(host, QUrl::DecodedMode);
    url.setPath(QStringLiteral("/apiauth/v1/client/ca_cert"), QUrl::DecodedMode);
    url.setPort(port.toInt());
    exchange(&HttpClientApi::getRequest, url, QString(), &HttpRequest::onCaCert, &ServerReply::isSuccess);
}

QString HttpRequest::getMacheineCheck(MachineState state, const QString &userName)
{
    QUrl url = FileConfig::GetInstance()->getDomainUrl(QStringLiteral("/uim/v3/client/status"));
    QUrlQuery query;
    query.addQueryItem(QStringLiteral("machine_id"), machineId());
    if (state == MachineJoin) {
        query.addQueryItem(QStringLiteral("keyword"), QStringLiteral("join"));
    } else if (state == MachineRemove) {
        query.addQueryItem(QStringLiteral("keyword"), QStringLiteral("remove"));
        query.addQueryItem(QStringLiteral("username"), userName);
    }
    addQuery(url, query);
    return exchange(&HttpClientApi::getRequest, url, QString(), &HttpRequest::onMacheineCheck,
                    &ServerReply::isGranted);
}

void HttpRequest::postCheckAccountPwd(const QString &userName, const QString &password)
{
    const QUrl url = FileConfig::GetInstance()->getDomainUrl(QStringLiteral("/uim/v3/client/auth"));
    const QString body = bodyText({
        {QStringLiteral("username"), userName},
        {QStringLiteral("password"), password},
    });
    exchange(&HttpClientApi::postRequest, url, body, &HttpRequest::onCheckAccountPwd,
             &ServerReply::isSuccess);
}

void HttpRequest::postJoinControl(const QString &userName)
{
    const QUrl url = FileConfig::GetInstance()->getDomainUrl(QStringLiteral("/uim/v3/client/join"));
    const QString body = bodyText({
        {QStringLiteral("machine_id"), machineId()},
        {QStringLiteral("name"), FileConfig::GetInstance()->readTerminalName()},
        {QStringLiteral("username"), userName},
        {QStringLiteral("mac"), FileConfig::GetInstance()->getMacAddress()},
    });
    exchange(&HttpClientApi::postRequest, url, body, &HttpRequest::onJoinControl, &ServerReply::isSuccess);
}

QString HttpRequest::postQuitControl(const QString &userName)
{
    const QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/remove"));
    const QString body = bodyText({
        {QStringLiteral("machine_id"), machineId()},
        {QStringLiteral("username"), userName},
        {QStringLiteral("mac"), FileConfig::GetInstance()->getMacAddress()},
    });
    return exchange(&HttpClientApi::postRequest, url, body, &HttpRequest::onQuitControl,
                    &ServerReply::isGranted);
}

QString HttpRequest::postRemoveStatus(const QString &userName, const QString &password)
{
    const QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/remove_status"));
    const QString body = bodyText({
        {QStringLiteral("username"), userName},
        {QStringLiteral("password"), password},
        {QStringLiteral("machine_id"), machineId()},
    });
    return exchange(&HttpClientApi::postRequest, url, body, &HttpRequest::onRemoveStatus,
                    &ServerReply::isGranted);
}

void HttpRequest::getCompanyName()
{
    QUrlQuery query;
    query.addQueryItem(QStringLiteral("id"), QStringLiteral("1"));
    QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/uim_department/id"));
    addQuery(url, query);
    exchange(&HttpClientApi::getRequest, url, QString(), &HttpRequest::onCompanyName,
             &ServerReply::isSuccess);
}

void HttpRequest::getUserInfo(const QString &userName)
{
    const QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/account"));
    const QString body = bodyText({
        {QStringLiteral("username"), userName},
        {QStringLiteral("machine_id"), machineId()},
    });
    exchange(&HttpClientApi::getRequest, url, body, &HttpRequest::onUserInfo, &ServerReply::isSuccess);
}

bool HttpRequest::checkPcName(const QString &name, QString &message)
{
    const QString url = QString::fromUtf8(vesk::KPCRegular).arg(m_host).arg(m_port);
    qInfo().noquote() << "------regularUrl-----:" << logText(url);
    QString reply;
    const int status = m_httpClient->getRequest(reply, url, QString(), true);
    qInfo() << "------initSshPort-------msg:" << logText(reply) << "code:" << status;

    const std::optional<QString> rule = aliasrule::read(reply, message);
    if (!rule)
        return false;
    return rule->isEmpty() ? checkTerminalByServer(name, message) : aliasrule::isObeyed(*rule, name, message);
}

bool HttpRequest::checkTerminalByServer(const QString &name, QString &message)
{
    const QUrl url = FileConfig::GetInstance()->getDomainUrl(QStringLiteral("/uim/v3/client/pc/verify/name"));
    qInfo() << "url===" << url;
    QString reply;
    const int status =
        m_httpClient->getRequest(reply, url.url(), bodyText({{QStringLiteral("pc_name"), name}}), true);
    qDebug() << "check pc name result:" << status << logText(reply);
    return aliasrule::isAccepted(status, reply, message);
}

void HttpRequest::onCaCert(const int &statusCode, const QString &data)
{
    Q_EMIT sigCaCert(statusCode, data);
}

void HttpRequest::onMacheineCheck(const int &statusCode, const QString &data)
{
    Q_EMIT sigMacheineCheck(statusCode, data);
}

void HttpRequest::onCheckAccountPwd(const int &statusCode, const QString &data)
{
    Q_EMIT sigCheckAccountPwd(statusCode, data);
}

void HttpRequest::onJoinControl(const int &statusCode, const QString &data)
{
    Q_EMIT sigJoinControl(statusCode, data);
}

void HttpRequest::onQuitControl(const int &statusCode, const QString &data)
{
    Q_EMIT sigQuitControl(statusCode, data);
}

void HttpRequest::onRemoveStatus(const int &statusCode, const QString &data)
{
    Q_EMIT sigRemoveStatus(statusCode, data);
}

void HttpRequest::onCompanyName(const int &statusCode, const QString &data)
{
    Q_EMIT sigCompanyName(statusCode, data);
}

void HttpRequest::onUserInfo(const int &statusCode, const QString &data)
{
    Q_EMIT sigUserInfo(statusCode, data);
}

GetHttpHeader *GetHttpHeader::GetInstance()
{
    static GetHttpHeader instance;
    return &instance;
}

QString GetHttpHeader::header()
{
    return QStringLiteral("v2");
}
