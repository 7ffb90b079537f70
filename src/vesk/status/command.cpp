// SPDX-License-Identifier: Apache-2.0
#include "command.h"

#include "process.h"

namespace {

constexpr int kTimeoutMs = 30000;

} // namespace

std::optional<QString> outputOf(const QString &program, const QStringList &arguments)
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("LC_ALL"), QStringLiteral("C.UTF-8"));
    vesk::base::Process process;
    process.setProcessEnvironment(environment);
    if (!process.run(program, arguments, kTimeoutMs))
        return std::nullopt;
    return QString::fromUtf8(process.readAllStandardOutput());
}
