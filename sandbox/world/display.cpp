// SPDX-License-Identifier: Apache-2.0
#include "display.h"

namespace sandbox {

bool Display::start(QString *error)
{
    const QString number = m_server.startAndReadLine(
        QStringLiteral("Xvfb"),
        {QStringLiteral("-displayfd"), QStringLiteral("1"), QStringLiteral("-screen"), QStringLiteral("0"),
         QStringLiteral("1280x1024x24"), QStringLiteral("-nolisten"), QStringLiteral("tcp"),
         QStringLiteral("-noreset")},
        error);
    m_name = QLatin1Char(':') + number;
    return !number.isEmpty();
}

} // namespace sandbox
