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

struct State
{
    QVector<fuzz::Reply> replies; // that are left
    QVector<Call> calls;          // since script()
    QStringList sslFiles;         // the latest TLS configuration: CA, certificate and key
};
State &state();

// Starts again with these replies; when they are used up, there is no reply (status 0).
void script(const QVector<fuzz::Reply> &replies);

} // namespace scriptedtransport
