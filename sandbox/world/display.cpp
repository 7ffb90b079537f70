// SPDX-License-Identifier: Apache-2.0
#include "display.h"

#include "journal/error.h"

#include <QRandomGenerator>

#include <array>
#include <cstdio>
#include <memory>

#include <X11/Xauth.h>

namespace sandbox {

void Display::start()
{
    writeAuthority();
    m_name = QLatin1Char(':') +
             m_server.startAndReadLine(
                 QStringLiteral("Xvfb"),
                 {QStringLiteral("-displayfd"), QStringLiteral("1"), QStringLiteral("-screen"),
                  QStringLiteral("0"), QStringLiteral("1280x1024x24"), QStringLiteral("-nolisten"),
                  QStringLiteral("tcp"), QStringLiteral("-noreset"), QStringLiteral("-auth"), authority()});
}

// One file for server and clients: the entry fits every host and display, since the server chooses its
// number.
void Display::writeAuthority() const
{
    char name[] = "MIT-MAGIC-COOKIE-1";
    std::array<quint32, 4> cookie{};
    QRandomGenerator::system()->fillRange(cookie.data(), cookie.size());
    Xauth entry = {};
    entry.family = FamilyWild;
    entry.name = name;
    entry.name_length = sizeof name - 1;
    entry.data = reinterpret_cast<char *>(cookie.data());
    entry.data_length = sizeof cookie;
    const std::unique_ptr<FILE, int (*)(FILE *)> file(
        std::fopen(QFile::encodeName(authority()).constData(), "wb"), &std::fclose);
    if (!file || XauWriteAuth(file.get(), &entry) != 1 || std::fflush(file.get()) != 0)
        throw Error(QStringLiteral("cannot write %1").arg(authority()));
}

} // namespace sandbox
