// SPDX-License-Identifier: Apache-2.0
#include "command.h"

#include <QProcess>
#include <QProcessEnvironment>

namespace {

constexpr int kLimitMs = 30000;

} // namespace

std::optional<QString> outputOf(const QString &program, const QStringList &arguments)
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("LC_ALL"), QStringLiteral("C.UTF-8"));
    QProcess process;
    process.setProcessEnvironment(environment);
    process.start(program, arguments, QIODevice::ReadOnly);
    if (!process.waitForFinished(kLimitMs))
        return std::nullopt;
    return QString::fromUtf8(process.readAllStandardOutput());
}
