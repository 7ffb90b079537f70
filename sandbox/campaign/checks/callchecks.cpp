// SPDX-License-Identifier: Apache-2.0
#include "campaign/checks/worldchecks.h"

#include <algorithm>

namespace sandbox {

namespace {

constexpr char kHeld[] = " is held ";

// One line of the journal that tells of a call from outside: "2026-11-24 13:00:00.123 server    request ...".
QByteArray toldBy(const QByteArray &line)
{
    constexpr int kSourceAt = 24;
    const QByteArray told = line.mid(kSourceAt);
    const bool isCall = told.startsWith("server ") || told.startsWith("bus ") ||
                        told.startsWith("command ") || told.startsWith("monitor ");
    return isCall ? told.simplified() : QByteArray();
}

// Without who tells it, and without the result; of a request without the address that it came from.
QString calledBy(const QByteArray &told)
{
    const QString call = QString::fromUtf8(told.mid(told.indexOf(' ') + 1));
    if (!told.startsWith("server "))
        return call.section(QLatin1String(" -> "), 0, 0);
    const auto from = call.indexOf(QLatin1String(" from "));
    const auto to = call.indexOf(QLatin1String(" to "), from);
    return from >= 0 && to >= 0 ? call.left(from) + call.mid(to) : call;
}

bool hasOneOf(const QByteArray &told, const QStringList &parts)
{
    return std::any_of(parts.begin(), parts.end(),
                       [&told](const QString &part) { return told.contains(part.toUtf8()); });
}

// The calls of a journal in the words of a plan. Two calls of a plan may look alike; the first counts for
// both.
class SeenCalls
{
public:
    SeenCalls(const JourneyPlan &plan, ExpectedCalls expected, const QByteArray &journal)
        : m_plan(plan)
        , m_expected(std::move(expected))
    {
        for (const QByteArray &line : journal.split('\n')) {
            const QByteArray told = toldBy(line);
            if (!told.isEmpty())
                take(told);
        }
    }

    QStringList complaints()
    {
        compareCounts();
        if (m_complaints.isEmpty())
            compareOrder();
        return m_complaints;
    }

private:
    struct Seen
    {
        int call = -1; // index; none: held, and has not ended yet
        QByteArray told;
    };

    int callOf(const QByteArray &told) const
    {
        const QString call = calledBy(told);
        const auto found = std::find_if(m_plan.calls.begin(), m_plan.calls.end(),
                                        [&call](const Call &each) { return each.line == call; });
        return found == m_plan.calls.end() ? -1 : static_cast<int>(found - m_plan.calls.begin());
    }

    bool isCallOfAny(const QByteArray &told) const
    {
        return told.startsWith("monitor ") && m_plan.members.contains(calledBy(told));
    }

    void take(const QByteArray &told)
    {
        const int call = callOf(told);
        const QByteArray who = told.split(' ').value(1);
        if (call >= 0 && !m_held.value(who).isEmpty())
            m_seen[m_held[who].takeFirst()] = {call, told};
        else if (call >= 0)
            m_seen.append({call, told});
        else if (hasOneOf(told, m_plan.ignored) || isCallOfAny(told))
            return;
        else if (told.contains(kHeld))
            hold(who.chopped(1));
        else if (!hasOneOf(told, m_plan.incomplete) || m_expected.incomplete-- <= 0)
            m_complaints.append(QStringLiteral("not planned: %1").arg(QString::fromUtf8(told)));
    }

    // A call that is held comes now, though its line comes when the hold is over.
    void hold(const QByteArray &who)
    {
        m_held[who].append(m_seen.size());
        m_seen.append(Seen());
    }

    // The first of those that look alike.
    int first(const Call &call) const { return callOf("server " + call.line.toUtf8()); }

    void compareCounts()
    {
        QMap<int, int> expected;
        QMap<int, QStringList> names;
        for (const Call &call : m_plan.calls) {
            expected[first(call)] += m_expected.times.value(call.name);
            names[first(call)].append(call.name);
        }
        for (auto each = expected.begin(); each != expected.end(); ++each) {
            const auto isMeant = [&each](const Seen &call) {
                return call.call == each.key();
            };
            const auto seen = std::count_if(m_seen.begin(), m_seen.end(), isMeant);
            if (seen != *each)
                m_complaints.append(QStringLiteral("call %1: expected %2 times, seen %3 times: %4")
                                        .arg(names.value(each.key()).join(QLatin1Char('/')))
                                        .arg(*each)
                                        .arg(seen)
                                        .arg(m_plan.calls.at(each.key()).line));
        }
    }

    // Of calls that run on their own only the start is in order: they come after the one before them.
    void compareOrder()
    {
        QVector<int> expected;
        QMap<int, int> earliest; // of a call on its own: how many others are ahead of it
        for (const Call &call : m_plan.calls) {
            if (call.isDetached)
                earliest.insert(first(call), expected.size());
            else
                expected += QVector<int>(m_expected.times.value(call.name), first(call));
        }
        int next = 0;
        for (const Seen &call : m_seen) {
            if (call.call < 0)
                continue;
            const bool isDetached = earliest.contains(call.call);
            const bool isInOrder =
                isDetached ? earliest.value(call.call) <= next : expected.value(next, -1) == call.call;
            next += isDetached ? 0 : 1;
            if (!isInOrder)
                m_complaints.append(QStringLiteral("not in order: %1").arg(QString::fromUtf8(call.told)));
        }
    }

    const JourneyPlan &m_plan;
    ExpectedCalls m_expected;
    QVector<Seen> m_seen;
    QMap<QByteArray, QVector<int>> m_held; // by service or command: places in m_seen
    QStringList m_complaints;
};

} // namespace

QStringList worldchecks::calls(const JourneyPlan &plan, const ExpectedCalls &expected,
                               const QByteArray &journal)
{
    return SeenCalls(plan, expected, journal).complaints();
}

} // namespace sandbox
