// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QString>

// What the server hands out when it accepts a join. What is missing or of another type is empty.
struct JoinReply
{
    QString key;         // of the terminal, Base64
    QString certificate; // of the terminal, Base64
    QString serverHost;  // where the server is from now on
    QString serverPort;

    // Whether key and certificate, once they are decoded, are short enough for those who read the files.
    bool hasReadableFiles() const;
};

// `data` is the object "data" of the reply. The server names its address as a host or as host:port; the host
// and the port that the user entered stand in for what it does not name, and for all that is not understood.
JoinReply readJoinReply(const QJsonObject &data, const QString &enteredHost, const QString &enteredPort);
