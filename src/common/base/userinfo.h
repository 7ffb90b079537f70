// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace vesk::base {

// The terminal record as a plain value: whether this terminal has joined its domain, where its server is and
// under which name it is known. Ports are strings of decimal digits, as in the file.
struct UserInfo
{
    bool isDomain = false;
    QString serverPort;   // port of the server that a joined terminal talks to
    QString serverHost;   // host of that server
    QString domainHost;   // host that the user entered when joining
    QString domainPort;   // port that the user entered when joining
    QString terminalName; // alias of the terminal
};

} // namespace vesk::base
