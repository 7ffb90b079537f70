// SPDX-License-Identifier: Apache-2.0
#include "httprequest.h"

#include "fileconfig.h"
#include "filecontent.h"
#include "httpclientapi.h"
#include "wellknownpaths.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QUrl>
#include <QUrlQuery>

namespace {

// A join that the server has begun must not be given up lightly.
constexpr int kReplyTimerMinutes = 2;

QString machineId()
{
    return vesk::base::FileContent::instace()->getMachineID(nullptr, false);
}

// Through the character pointer, so that the text ends at the first NUL byte.
QString bodyText(const QJsonObject &body)
{
    return QString::fromUtf8(QJsonDocument(body).toJson().constData());
}

// An unusable URL stays one: setting its query would clear the error and let the call go to another port.
void addQuery(QUrl &url, const QUrlQuery &query)
{
    if (url.isValid())
        url.setQuery(query);
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

    QString reply;
    const int status = m_httpClient->getRequest(reply, url.url(), QString(), true);
    onCaCert(status, reply);
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

    QString reply;
    const int status = m_httpClient->getRequest(reply, url.url(), QString(), true);
    onMacheineCheck(status, reply);
    return reply;
}

void HttpRequest::postCheckAccountPwd(const QString &userName, const QString &password)
{
    const QUrl url = FileConfig::GetInstance()->getDomainUrl(QStringLiteral("/uim/v3/client/auth"));
    const QString body = bodyText({
        {QStringLiteral("username"), userName},
        {QStringLiteral("password"), password},
    });

    QString reply;
    const int status = m_httpClient->postRequest(reply, url.url(), body, true);
    onCheckAccountPwd(status, reply);
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

    QString reply;
    const int status = m_httpClient->postRequest(reply, url.url(), body, true);
    onJoinControl(status, reply);
}

QString HttpRequest::postQuitControl(const QString &userName)
{
    const QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/remove"));
    const QString body = bodyText({
        {QStringLiteral("machine_id"), machineId()},
        {QStringLiteral("username"), userName},
        {QStringLiteral("mac"), FileConfig::GetInstance()->getMacAddress()},
    });

    QString reply;
    const int status = m_httpClient->postRequest(reply, url.url(), body, true);
    onQuitControl(status, reply);
    return reply;
}

QString HttpRequest::postRemoveStatus(const QString &userName, const QString &password)
{
    const QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/remove_status"));
    const QString body = bodyText({
        {QStringLiteral("username"), userName},
        {QStringLiteral("password"), password},
        {QStringLiteral("machine_id"), machineId()},
    });

    QString reply;
    const int status = m_httpClient->postRequest(reply, url.url(), body, true);
    onRemoveStatus(status, reply);
    return reply;
}

void HttpRequest::getCompanyName()
{
    QUrlQuery query;
    query.addQueryItem(QStringLiteral("id"), QStringLiteral("1"));
    QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/uim_department/id"));
    addQuery(url, query);

    QString reply;
    const int status = m_httpClient->getRequest(reply, url.url(), QString(), true);
    onCompanyName(status, reply);
}

void HttpRequest::getUserInfo(const QString &userName)
{
    const QUrl url = FileConfig::GetInstance()->getServerUrl(QStringLiteral("/uim/v3/client/account"));
    const QString body = bodyText({
        {QStringLiteral("username"), userName},
        {QStringLiteral("machine_id"), machineId()},
    });

    QString reply;
    const int status = m_httpClient->getRequest(reply, url.url(), body, true);
    onUserInfo(status, reply);
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
