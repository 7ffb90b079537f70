// SPDX-License-Identifier: Apache-2.0
#include "backend.h"

#include "bubblewrap.h"
#include "proot.h"

#include <QProcess>

namespace sandbox {

namespace {

constexpr int kTrialLimitMs = 10000;

// Empty when the trial passed, else why not.
QString tryOut(const QString &tool, const QStringList &arguments)
{
    QProcess process;
    process.start(tool, arguments);
    if (!process.waitForStarted(kTrialLimitMs))
        return QStringLiteral("not installed");
    if (!process.waitForFinished(kTrialLimitMs)) {
        process.kill();
        process.waitForFinished(kTrialLimitMs);
        return QStringLiteral("its trial run does not end");
    }
    if (process.exitStatus() == QProcess::NormalExit && process.exitCode() == 0)
        return {};
    const QString said = QString::fromLocal8Bit(process.readAllStandardError()).trimmed();
    return said.isEmpty() ? QStringLiteral("its trial run fails") : said.section(QLatin1Char('\n'), 0, 0);
}

} // namespace

std::unique_ptr<Backend> Backend::choose(IsolationOptions::Backend wanted, QString *error)
{
    QStringList reasons;
    if (wanted != IsolationOptions::Backend::Proot) {
        const QString reason = tryOut(QStringLiteral("bwrap"), Bubblewrap::trialArguments());
        if (reason.isEmpty())
            return std::make_unique<Bubblewrap>();
        reasons.append(QStringLiteral("bubblewrap does not work here (%1)").arg(reason));
    }
    if (wanted != IsolationOptions::Backend::Bubblewrap) {
        const QString reason = tryOut(QStringLiteral("proot"), Proot::trialArguments());
        if (reason.isEmpty())
            return std::make_unique<Proot>();
        reasons.append(QStringLiteral("proot does not work here (%1)").arg(reason));
    }
    *error = reasons.join(QStringLiteral("; "));
    return nullptr;
}

} // namespace sandbox
