// SPDX-License-Identifier: Apache-2.0
// Has the program's client of the server check an account, "memory-probe PORT CA-FILE", prints a line and
// lives until its input ends.
#include "fileconfig.h"
#include "httprequest.h"

#include <cstdio>

int main(int argc, char **argv)
{
    if (argc != 3)
        return 2;
    FileConfig::GetInstance()->setDomainHost(QStringLiteral("localhost"));
    FileConfig::GetInstance()->setDomainPort(QString::fromLatin1(argv[1]));
    HttpRequest *server = HttpRequest::GetInstance();
    server->setSSLConfig(QString::fromLocal8Bit(argv[2]), QString(), QString());
    server->postCheckAccountPwd(QStringLiteral("liming"), QStringLiteral("Canary-98765"));
    std::puts("checked");
    std::fflush(stdout);
    return std::getchar() == EOF ? 0 : 2;
}
