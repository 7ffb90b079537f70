// SPDX-License-Identifier: Apache-2.0
#include "scriptedtransport.h"

#include "httpclientapi.h"

scriptedtransport::State &scriptedtransport::state()
{
    static State instance;
    return instance;
}

struct HttpClientApi::Private
{
};

HttpClientApi::HttpClientApi(QObject *parent, bool /*shareConnection*/)
    : QObject(parent)
{
}

HttpClientApi::~HttpClientApi() = default;

void HttpClientApi::setReplyTimer(const int & /*minutes*/) {}

void HttpClientApi::setSSLConfig(const QString &caFile, const QString &certificateFile,
                                 const QString &keyFile)
{
    scriptedtransport::state().sslFiles = QStringList{caFile, certificateFile, keyFile};
}

int HttpClientApi::getRequest(QString &reply, const QString &url, const QString &body, bool keepWindowAlive)
{
    return request("GET", reply, url, body, keepWindowAlive);
}

int HttpClientApi::postRequest(QString &reply, const QString &url, const QString &body, bool keepWindowAlive)
{
    return request("POST", reply, url, body, keepWindowAlive);
}

int HttpClientApi::request(const char * /*method*/, QString &reply, const QString &url, const QString &body,
                           bool /*keepWindowAlive*/)
{
    auto &now = scriptedtransport::state();
    now.calls.append({url, body});
    const fuzz::Reply next = now.replies.isEmpty() ? fuzz::Reply() : now.replies.takeFirst();
    reply = next.text;
    return next.status;
}

void scriptedtransport::script(const QVector<fuzz::Reply> &replies)
{
    state().replies = replies;
    state().calls.clear();
}
