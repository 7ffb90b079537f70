// SPDX-License-Identifier: Apache-2.0
#include "play/actions.h"

#include "journal/error.h"
#include "play/hostnames.h"
#include "play/obstacles.h"
#include "play/processtable.h"
#include "play/useractions.h"
#include "play/windowmanager.h"
#include "world/world.h"

#include <algorithm>
#include <functional>

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

// Throws an Error when it cannot be done.
using Handler = std::function<void(World &)>;

// Everything that the program has started ends with it, so a held command writes no more.
void awaitEnd(World &world)
{
    if (world.program().state() != QProcess::NotRunning && !world.program().waitForFinished(kEndLimitMs))
        throw Error(QStringLiteral("the program does not end"));
}

template <int number>
void signalProgram(World &world)
{
    const pid_t program = descendantNamed("veskw");
    if (program == 0 || ::kill(program, number) != 0)
        throw Error(QStringLiteral("there is no program"));
    awaitEnd(world);
}

// The walk reports the result.
void askToClose(World &world)
{
    if (windowmanager::askToClose(world.environment()) == 0)
        throw Error(QStringLiteral("no window shows"));
}

void ask(World &world)
{
    if (!useractions::isAnswering(world, kAnswerLimitMs))
        throw Error(QStringLiteral("the window does not answer"));
}

void fillTmp(World &world)
{
    obstacles::put(world.state(), {{QStringLiteral("/tmp/filler"), QStringLiteral("filler")}});
}

const QMap<QString, Handler> &handlers()
{
    static const QMap<QString, Handler> all = {
        {QStringLiteral("ask"), ask},
        {QStringLiteral("close"), askToClose},
        {QStringLiteral("lose-route"), hostnames::loseRoute},
        {QStringLiteral("forget-names"), hostnames::forget},
        {QStringLiteral("clear-places"),
         [](World &world) {
             obstacles::clear(world.state());
         }},
        {QStringLiteral("fill-tmp"), fillTmp},
        {QStringLiteral("press-next"),
         [](World &world) {
             useractions::press(world, QStringLiteral("下一步"));
         }},
        {QStringLiteral("press-leave"),
         [](World &world) {
             useractions::press(world, QStringLiteral("解除"));
         }},
        {QStringLiteral("start-again"), useractions::startAgain},
        {QStringLiteral("drop-connections"), &World::dropConnections},
        {QStringLiteral("stop-session-bus"), &World::stopSessionBus},
        {QStringLiteral("stop-system-bus"), &World::stopSystemBus},
        {QStringLiteral("stop-display"),
         [](World &world) {
             world.stopDisplay();
             awaitEnd(world);
         }},
        {QStringLiteral("kill"), signalProgram<SIGKILL>},
        {QStringLiteral("terminate"), signalProgram<SIGTERM>},
        {kRelease, &World::release},
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
    QString complaint;
    const bool isDone = attempt(&complaint, [&] {
        if (name == kFailCall)
            m_fault.attach(descendantNamed("veskw"));
        else
            handlers().value(name)(m_world);
    });
    if (isFollowed)
        follow(earlier, viewFiles(m_world.state()), m_before);
    if (!isDone)
        m_complaints.append(QStringLiteral("%1: %2").arg(name, complaint));
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
