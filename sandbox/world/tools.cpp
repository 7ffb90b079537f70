// SPDX-License-Identifier: Apache-2.0
#include "tools.h"

#include <QCoreApplication>
#include <QFileInfo>

namespace sandbox {

QString findTool(const QString &name, QString *error)
{
    const QString here = QCoreApplication::applicationDirPath();
    for (const QString &folder : {here, here + QStringLiteral("/../bin")}) {
        const QFileInfo candidate(folder + QLatin1Char('/') + name);
        if (candidate.isExecutable())
            return candidate.canonicalFilePath();
    }
    *error = QStringLiteral("there is no %1 beside %2").arg(name, QCoreApplication::applicationFilePath());
    return {};
}

} // namespace sandbox
