// SPDX-License-Identifier: Apache-2.0
// Makes one GET in a process that has no application object: transport-probe URL CA-FILE. Prints the status.
#include "httpclientapi.h"

#include <cstdio>

int main(int argc, char **argv)
{
    if (argc != 3)
        return 2;
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(QString::fromLocal8Bit(argv[2]), QString(), QString());
    QString reply;
    std::printf("%d\n", client.getRequest(reply, QString::fromLocal8Bit(argv[1]), QString(), true));
    return 0;
}
