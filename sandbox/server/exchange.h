// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "scenario/scenario.h"
#include "server/refusals.h"

#include <QByteArray>
#include <QJsonObject>
#include <QString>
#include <QUrl>

namespace sandbox {

// The two addresses of the server. Enrolment asks for no client certificate; Managed is reached only with one
// that our CA issued.
enum class Listener { Enrolment, Managed };

struct Request
{
    Listener listener = Listener::Enrolment;
    QString method;
    QUrl target; // path and query
    QByteArray body;
    QString host; // header "Host": the address as the client has it
    QString peerAddress;
    QString certificateName;   // common name of the client certificate, empty without one
    QString certificateSerial; // lower-case hexadecimal
};

struct Reply
{
    int status = 200;
    QByteArray body;
    bool isJson = true;
    QString allow = {};    // header "Allow", where there is one
    QString location = {}; // header "Location", likewise
};

// What goes out, and how.
struct Answer
{
    Reply reply;
    Fault fault = Fault::None;
    bool isHeld = false; // until it is released, see Hold
};

// The body of a reply: {"code":0,"data":{},"msg":""}.
QByteArray envelope(int code, const QString &words, const QJsonObject &data);
Reply success(const QJsonObject &data);
Reply refusal(const Refused &refused);

// The bytes of an answer as they go out. A fault leaves out what it keeps back: half of the header or of the
// body is missing, or there is nothing at all; a drip announces a body that never ends.
QByteArray wireOf(const Answer &answer, bool keepAlive);

// Both texts as they stand in the journal, without passwords and keys. A password that is not the right one
// says so, and of keys and certificates there is the beginning of their SHA-256 hash:
//     request POST /uim/v3/client/auth from 127.0.0.1 to localhost:4433
//     {"password":"***","username":"liming"} reply 200 {"code":0,"data":{},"msg":""} to POST
//     /uim/v3/client/auth fault reset to POST /uim/v3/client/auth
// password: the right one.
QString journalText(const Request &request, const QString &password);
QString journalText(const Request &request, const Answer &answer);

} // namespace sandbox
