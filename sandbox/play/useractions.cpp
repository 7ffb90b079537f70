// SPDX-License-Identifier: Apache-2.0
#include "play/useractions.h"

#include "autopilot/accessiblebus.h"
#include "autopilot/waitfor.h"
#include "world/world.h"

namespace sandbox {

namespace {

constexpr int kLimitMs = 20000;

const QString kRefusal = QStringLiteral("进程已存在");

// Normally, within the limit.
bool awaitEnd(const QProcess &process)
{
    return serveUntil(kLimitMs, [&process] { return process.state() == QProcess::NotRunning; }) &&
           process.exitStatus() == QProcess::NormalExit && process.exitCode() == 0;
}

// `verb`: press or answer; see the autopilot.
QString byAutopilot(World &world, const QString &verb, const QString &what)
{
    QString error;
    Child autopilot(world.state().at("world.log"));
    autopilot.setProcessEnvironment(world.readerEnvironment());
    autopilot.start(findTool(QStringLiteral("vesk-autopilot"), &error), {verb, World::programName(), what});
    if (awaitEnd(autopilot)) {
        world.state().journal().write(QStringLiteral("world"),
                                      QStringLiteral("the scenario: done, %1 %2").arg(verb, what));
        return {};
    }
    return QStringLiteral("%1 %2: not possible").arg(verb, what);
}

} // namespace

QString useractions::press(World &world, const QString &button)
{
    return byAutopilot(world, QStringLiteral("press"), button);
}

QString useractions::startAgain(World &world)
{
    QString error;
    Child second(world.state().programLog());
    const QString program = findTool(QStringLiteral("veskw"), &error);
    if (program.isEmpty() || !world.startProcess(&second, {program}, &error))
        return error;
    error = byAutopilot(world, QStringLiteral("answer"), kRefusal);
    if (!error.isEmpty())
        return error;
    return awaitEnd(second) ? QString() : QStringLiteral("the second instance does not end with exit code 0");
}

bool useractions::isAnswering(const World &world, int limitMs)
{
    try {
        return !AccessibleBus(world.readerBusAddress(), limitMs).programs(World::programName()).isEmpty();
    } catch (const Error &) {
        return false;
    }
}

} // namespace sandbox
