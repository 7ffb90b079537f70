// SPDX-License-Identifier: Apache-2.0
#include "campaign/worlds.h"

#include "world/child.h"
#include "world/world.h"

#include <QDir>
#include <QFileInfo>

namespace sandbox {

namespace {

constexpr int kJoinLimitMs = 120000;

// Files of a stopped world that a copy must not have.
bool forgetRun(const QString &state, QString *error)
{
    bool good = true;
    for (const char *entry : {"journal.log", "program.log", "program.position", "world.log", "lock"}) {
        const QString path = state + QLatin1Char('/') + QLatin1String(entry);
        good = (QFile::remove(path) || !QFileInfo::exists(path)) && good;
    }
    good = QDir(state + QStringLiteral("/screenshots")).removeRecursively() && good;
    QFile journal(state + QStringLiteral("/journal.log"));
    good = journal.open(QIODevice::WriteOnly) && good; // the sign of a world
    if (!good)
        *error = QStringLiteral("cannot remove the traces of the run from %1").arg(state);
    return good;
}

// An earlier one.
void removeWorld(const QString &state)
{
    if (QFileInfo::exists(state + QStringLiteral("/journal.log")))
        QDir(state).removeRecursively();
}

} // namespace

bool worlds::makeNew(const QString &state, QString *error)
{
    removeWorld(state);
    WorldOptions options;
    options.state = state;
    options.scenarioFile = Scenario::standardDirectory() + QStringLiteral("/join-ok.json");
    World world(options);
    if (!world.start(error))
        return false;
    world.stop();
    return forgetRun(state, error);
}

bool worlds::makeJoined(const QString &state, QString *error)
{
    removeWorld(state);
    const QString program = findTool(QStringLiteral("vesk-sandbox"), error);
    Child join({});
    join.setProcessChannelMode(QProcess::MergedChannels);
    join.start(program, {QStringLiteral("--state"), state, QStringLiteral("--headless"),
                         QStringLiteral("--autopilot"), QStringLiteral("join")});
    if (join.waitForFinished(kJoinLimitMs) && join.exitCode() == 0)
        return forgetRun(state, error);
    *error =
        QStringLiteral("the join that a leave needs has failed: %1").arg(QString::fromUtf8(join.readAll()));
    return false;
}

bool worlds::copy(const QString &from, const QString &state, QString *error)
{
    if (!QFileInfo::exists(state) &&
        vesk::base::Process().execute(QStringLiteral("cp"), {QStringLiteral("-a"), from, state}) == 0)
        return true;
    *error = QStringLiteral("cannot copy the world %1 to %2").arg(from, state);
    return false;
}

} // namespace sandbox
