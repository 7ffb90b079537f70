// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "replies.h"

#include <QString>
#include <QStringList>
#include <QVector>

// The transport of the fuzz targets: an HttpClientApi that puts nothing on the wire and answers from a list.
namespace scriptedtransport {

struct Call
{
    QString url;
    QString body;
};

// Starts anew with these replies; when they are used up, there is no reply (status 0).
void script(const QVector<fuzz::Reply> &replies);
// The calls since then.
const QVector<Call> &calls();
// The latest TLS configuration: CA, certificate and key.
QStringList sslFiles();

} // namespace scriptedtransport
