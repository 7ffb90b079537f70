// SPDX-License-Identifier: Apache-2.0
#include "play/actions.h"

#include "play/hostnames.h"
#include "play/obstacles.h"
#include "play/processtable.h"
#include "play/useractions.h"
#include "play/windowmanager.h"
#include "world/world.h"

#include <algorithm>

#include <csignal>

namespace sandbox {

namespace {

constexpr int kAnswerLimitMs = 2000;
constexpr int kEndLimitMs = 30000;
const QString kReady = QStringLiteral("@ready");
const QString kRelease = QStringLiteral("release");
const QString kFailCall = QStringLiteral("fail-call"); // no word of a scenario: it says so under "syscall"
const QStringList kEndings{QStringLiteral("kill"), QStringLiteral("terminate"),
                           QStringLiteral("stop-display")};

const QStringList kOnFiles{QStringLiteral("clear-places"), QStringLiteral("fill-tmp")};

// What went wrong, or nothing.
using Handler = QString (*)(World &world);

// Everything that the program has started ends with it, so a held command writes no more.
QString awaitEnd(World &world)
{
    const bool hasEnded =
        world.program().state() == QProcess::NotRunning || world.program().waitForFinished(kEndLimitMs);
    return hasEnded ? QString() : QStringLiteral("the program does not end");
}

template <int number>
QString signalProgram(World &world)
{
    const pid_t program = descendantNamed("veskw");
    return program != 0 && ::kill(program, number) == 0 ? awaitEnd(world)
                                                        : QStringLiteral("there is no program");
}

template <void (World::*work)()>
QString callWorld(World &world)
{
    (world.*work)();
    return {};
}

QString stopDisplay(World &world)
{
    world.stopDisplay();
    return awaitEnd(world);
}

QString repair(World &world)
{
    QString error;
    world.repair(&error);
    return error;
}

// The walk reports the result.
QString askToClose(World &world)
{
    return windowmanager::askToClose(world.environment()) > 0 ? QString() : QStringLiteral("no window shows");
}

QString ask(World &world)
{
    return useractions::isAnswering(world, kAnswerLimitMs) ? QString()
                                                           : QStringLiteral("the window does not answer");
}

QString clearPlaces(World &world)
{
    obstacles::clear(world.state());
    return {};
}

QString fillTmp(World &world)
{
    QString error;
    obstacles::put(world.state(), {{QStringLiteral("/tmp/filler"), QStringLiteral("filler")}}, &error);
    return error;
}

QString pressNext(World &world)
{
    return useractions::press(world, QStringLiteral("下一步"));
}

QString pressLeave(World &world)
{
    return useractions::press(world, QStringLiteral("解除"));
}

const QMap<QString, Handler> &handlers()
{
    static const QMap<QString, Handler> all = {
        {QStringLiteral("ask"), ask},
        {QStringLiteral("close"), askToClose},
        {QStringLiteral("repair"), repair},
        {QStringLiteral("lose-route"), hostnames::loseRoute},
        {QStringLiteral("forget-names"), hostnames::forget},
        {QStringLiteral("clear-places"), clearPlaces},
        {QStringLiteral("fill-tmp"), fillTmp},
        {QStringLiteral("press-next"), pressNext},
        {QStringLiteral("press-leave"), pressLeave},
        {QStringLiteral("start-again"), useractions::startAgain},
        {QStringLiteral("drop-connections"), callWorld<&World::dropConnections>},
        {QStringLiteral("stop-session-bus"), callWorld<&World::stopSessionBus>},
        {QStringLiteral("stop-system-bus"), callWorld<&World::stopSystemBus>},
        {QStringLiteral("stop-display"), stopDisplay},
        {QStringLiteral("kill"), signalProgram<SIGKILL>},
        {QStringLiteral("terminate"), signalProgram<SIGTERM>},
        {kRelease, callWorld<&World::release>},
    };
    return all;
}

} // namespace

Actions::Actions(World &world, const QJsonArray &actions, SyscallFault &fault, ViewFiles *before)
    : m_world(world)
    , m_fault(fault)
    , m_before(before)
{
    if (!fault.moment().isEmpty())
        m_actions.append({fault.moment(), kFailCall});
    for (const QJsonValue &each : actions)
        m_actions.append({json::text(each.toObject(), "on"), json::text(each.toObject(), "do")});
}

bool Actions::awaitWindow() const
{
    return std::any_of(m_actions.begin(), m_actions.end(),
                       [](const Action &action) { return action.on == kReady; });
}

void Actions::performReady()
{
    for (int index = 0; index < m_actions.size(); ++index) {
        if (m_actions.at(index).on != kReady)
            continue;
        m_fired.insert(index);
        perform(m_actions.at(index).what);
    }
}

void Actions::onLine(const QByteArray &line)
{
    m_lines.append(line);
    if (m_performs)
        return;
    m_performs = true;
    while (!m_lines.isEmpty())
        performDue(m_lines.takeFirst());
    m_performs = false;
}

void Actions::performDue(const QByteArray &line)
{
    for (int index = 0; index < m_actions.size(); ++index) {
        const Action &action = m_actions.at(index);
        if (m_fired.contains(index) || !line.contains(action.on.toUtf8()))
            continue;
        m_fired.insert(index);
        perform(action.what);
    }
    if (line.endsWith("is held for now"))
        ++m_held;
    releaseDue();
}

void Actions::releaseDue()
{
    if (does({kRelease}) || (does(kEndings) && m_fired.size() < m_actions.size()))
        return;
    for (; m_held > 0; --m_held)
        m_world.release();
}

bool Actions::does(const QStringList &names) const
{
    return std::any_of(m_actions.begin(), m_actions.end(),
                       [&names](const Action &action) { return names.contains(action.what); });
}

void Actions::perform(const QString &name)
{
    m_world.state().journal().write(QStringLiteral("world"), QStringLiteral("the scenario: %1").arg(name));
    const bool isFollowed = m_before != nullptr && kOnFiles.contains(name);
    const ViewFiles earlier = isFollowed ? viewFiles(m_world.state()) : ViewFiles();
    const QString complaint = act(name);
    if (isFollowed)
        follow(earlier, viewFiles(m_world.state()), m_before);
    if (!complaint.isEmpty())
        m_complaints.append(QStringLiteral("%1: %2").arg(name, complaint));
}

QString Actions::act(const QString &name)
{
    return name == kFailCall ? m_fault.attach(descendantNamed("veskw")) : handlers().value(name)(m_world);
}

QStringList Actions::complaints() const
{
    QStringList result = m_complaints;
    for (int index = 0; index < m_actions.size(); ++index) {
        if (!m_fired.contains(index))
            result.append(QStringLiteral("%1: never triggered, no line with \"%2\"")
                              .arg(m_actions.at(index).what, m_actions.at(index).on));
    }
    return result;
}

} // namespace sandbox
