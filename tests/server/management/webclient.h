// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "certificate.h"

#include <QByteArray>
#include <QJsonObject>
#include <QString>

#include <functional>

// A plain HTTPS client on libcurl, to look at a server with other eyes than the product's. One request for
// each call, on a connection of its own.
struct WebClient
{
    QByteArray caPem;
    sandbox::KeyPair credentials; // shown when there is a certificate in it
    QString host = QStringLiteral("127.0.0.1");
    quint16 port = 0;
    std::function<bool()> givesUp; // asked now and then during a request; true ends it

    struct Answer
    {
        int curlCode = -1; // CURLE_OK is 0
        QByteArray trouble;
        int status = 0;
        QByteArray header;
        QByteArray body;

        QJsonObject json() const;
        int code() const { return json().value(QStringLiteral("code")).toInt(-1); }
        QString msg() const { return json().value(QStringLiteral("msg")).toString(); }
        QJsonObject data() const { return json().value(QStringLiteral("data")).toObject(); }
    };

    // `target` is path and query. The body is sent with every method when it is not empty.
    Answer send(const QByteArray &method, const QByteArray &target, const QByteArray &body = {}) const;
};
