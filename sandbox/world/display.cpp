// SPDX-License-Identifier: Apache-2.0
#include "display.h"

#include <QRandomGenerator>

#include <array>
#include <cstdio>
#include <memory>

#include <X11/Xauth.h>

namespace sandbox {

bool Display::start(QString *error)
{
    if (!writeAuthority()) {
        *error = QStringLiteral("cannot write %1").arg(authority());
        return false;
    }
    const QString number = m_server.startAndReadLine(
        QStringLiteral("Xvfb"),
        {QStringLiteral("-displayfd"), QStringLiteral("1"), QStringLiteral("-screen"), QStringLiteral("0"),
         QStringLiteral("1280x1024x24"), QStringLiteral("-nolisten"), QStringLiteral("tcp"),
         QStringLiteral("-noreset"), QStringLiteral("-auth"), authority()},
        error);
    m_name = QLatin1Char(':') + number;
    return !number.isEmpty();
}

// One file for server and clients: the entry fits every host and display, since the server chooses its
// number.
bool Display::writeAuthority() const
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
    return file && XauWriteAuth(file.get(), &entry) == 1 && std::fflush(file.get()) == 0;
}

} // namespace sandbox
