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
void byAutopilot(World &world, const QString &verb, const QString &what)
{
    Child autopilot(world.state().at("world.log"));
    autopilot.setProcessEnvironment(world.readerEnvironment());
    autopilot.start(findTool(QStringLiteral("vesk-autopilot")), {verb, World::programName(), what});
    if (!awaitEnd(autopilot))
        throw Error(QStringLiteral("%1 %2: not possible").arg(verb, what));
    world.state().journal().write(QStringLiteral("world"),
                                  QStringLiteral("the scenario: done, %1 %2").arg(verb, what));
}

} // namespace

void useractions::press(World &world, const QString &button)
{
    byAutopilot(world, QStringLiteral("press"), button);
}

void useractions::startAgain(World &world)
{
    Child second(world.state().programLog());
    world.startProcess(&second, {findTool(QStringLiteral("veskw"))});
    byAutopilot(world, QStringLiteral("answer"), kRefusal);
    if (!awaitEnd(second))
        throw Error(QStringLiteral("the second instance does not end with exit code 0"));
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
