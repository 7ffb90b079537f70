// SPDX-License-Identifier: Apache-2.0
#include "play/actions.h"

#include "play/hostnames.h"
#include "play/obstacles.h"
#include "play/processtable.h"
#include "play/useractions.h"
#include "play/windowmanager.h"
#include "scenario/json.h"
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
const QStringList kEndings{QStringLiteral("kill"), QStringLiteral("terminate"),
                           QStringLiteral("stop-display")};

struct Known
{
    const char *name;
    std::function<QString(World &)> perform; // what went wrong, or nothing
    bool changesFiles = false;
};

// With the program everything ends that it has started, so a command that is held says no more.
QString awaitEnd(World &world)
{
    const bool hasEnded =
        world.program().state() == QProcess::NotRunning || world.program().waitForFinished(kEndLimitMs);
    return hasEnded ? QString() : QStringLiteral("the program does not end");
}

QString signalProgram(World &world, int number)
{
    const pid_t program = descendantNamed("veskw");
    return program != 0 && ::kill(program, number) == 0 ? awaitEnd(world)
                                                        : QStringLiteral("there is no program");
}

QString stopDisplay(World &world)
{
    world.stopDisplay();
    return awaitEnd(world);
}

QString mend(World &world)
{
    QString error;
    world.mend(&error);
    return error;
}

QString askToClose(World &world)
{
    WindowManager manager(world.environment());
    return manager.askToClose() > 0 ? QString() : QStringLiteral("no window shows");
}

QString ask(World &world)
{
    return useractions::isAnswering(world, kAnswerLimitMs) ? QString()
                                                           : QStringLiteral("the window does not answer");
}

template <typename Work>
std::function<QString(World &)> simple(Work work)
{
    return [work](World &world) {
        work(world);
        return QString();
    };
}

const std::vector<Known> &known()
{
    static const std::vector<Known> all = {
        {"ask", ask},          // does the window answer?
        {"close", askToClose}, // asks it to close; what comes of it the walk tells
        {"mend", mend},        // the fault is over
        {"lose-route",
         [](World &world) {
             return hostnames::loseRoute(world.state());
         }},
        {"forget-names",
         [](World &world) {
             return hostnames::forget(world.state());
         }},
        {"clear-places", simple([](World &world) { obstacles::clear(world.state()); }), true},
        {"fill-tmp",
         [](World &world) {
             QString error;
             obstacles::put(world.state(), {{QStringLiteral("/tmp/filler"), QStringLiteral("filler")}},
                            &error);
             return error;
         },
         true},
        {"press-next",
         [](World &world) {
             return useractions::press(world, QStringLiteral("下一步"));
         }},
        {"press-leave",
         [](World &world) {
             return useractions::press(world, QStringLiteral("解除"));
         }},
        {"start-again", useractions::startAgain},
        {"drop-connections", simple([](World &world) { world.dropConnections(); })},
        {"stop-session-bus", simple([](World &world) { world.stopSessionBus(); })},
        {"stop-system-bus", simple([](World &world) { world.stopSystemBus(); })},
        {"stop-display", stopDisplay},
        {"kill",
         [](World &world) {
             return signalProgram(world, SIGKILL);
         }},
        {"terminate",
         [](World &world) {
             return signalProgram(world, SIGTERM);
         }},
        {"release", simple([](World &world) { world.release(); })},
    };
    return all;
}

} // namespace

Actions::Actions(World &world, const QJsonArray &actions, ViewFiles *before)
    : m_world(world)
    , m_before(before)
{
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
    for (const Known &each : known()) {
        if (name != QLatin1String(each.name))
            continue;
        const bool isFollowed = each.changesFiles && m_before != nullptr;
        const ViewFiles earlier = isFollowed ? viewFiles(m_world.state()) : ViewFiles();
        const QString complaint = each.perform(m_world);
        if (isFollowed)
            follow(earlier, viewFiles(m_world.state()), m_before);
        if (!complaint.isEmpty())
            m_complaints.append(QStringLiteral("%1: %2").arg(name, complaint));
    }
}

QStringList Actions::complaints() const
{
    QStringList result = m_complaints;
    for (int index = 0; index < m_actions.size(); ++index) {
        if (!m_fired.contains(index))
            result.append(QStringLiteral("%1: its moment never came, \"%2\"")
                              .arg(m_actions.at(index).what, m_actions.at(index).on));
    }
    return result;
}

} // namespace sandbox
