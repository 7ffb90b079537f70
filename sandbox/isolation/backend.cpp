// SPDX-License-Identifier: Apache-2.0
#include "backend.h"

#include "journal/error.h"
#include "process.h"

namespace sandbox {

namespace {

constexpr int kTrialTimeoutMs = 10000;

// Empty when the trial passed, else why not.
QString tryOut(const QString &tool, const QStringList &arguments)
{
    vesk::base::Process process;
    if (!process.run(tool, arguments, kTrialTimeoutMs))
        return process.complaint();
    if (process.exitStatus() == QProcess::NormalExit && process.exitCode() == 0)
        return {};
    const QString said = QString::fromLocal8Bit(process.readAllStandardError()).trimmed();
    return said.isEmpty() ? QStringLiteral("its trial run fails") : said.section(QLatin1Char('\n'), 0, 0);
}

} // namespace

std::unique_ptr<Backend> Backend::choose(IsolationOptions::Backend wanted)
{
    QStringList reasons;
    const auto works = [&reasons](const char *tool, const QStringList &trial) {
        const QString reason = tryOut(QLatin1String(tool), trial);
        reasons.append(QStringLiteral("%1 does not work here (%2)").arg(QLatin1String(tool), reason));
        return reason.isEmpty();
    };
    if (wanted != IsolationOptions::Backend::Proot && works("bwrap", Bubblewrap::trialArguments()))
        return std::make_unique<Bubblewrap>();
    if (wanted != IsolationOptions::Backend::Bubblewrap && works("proot", Proot::trialArguments()))
        return std::make_unique<Proot>();
    throw Error(reasons.join(QStringLiteral("; ")));
}

} // namespace sandbox
