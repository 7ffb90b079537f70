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
    const bool isCall = told.startsWith("server ") || told.startsWith("bus ") || told.startsWith("command ");
    return isCall ? told.simplified() : QByteArray();
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
        for (int index = 0; index < m_plan.calls.size(); ++index) {
            if (told.contains(m_plan.calls.at(index).line.simplified().toUtf8()))
                return index;
        }
        return -1;
    }

    void take(const QByteArray &told)
    {
        const int call = callOf(told);
        const QByteArray who = told.split(' ').value(1);
        if (call >= 0 && !m_held.value(who).isEmpty())
            m_seen[m_held[who].takeFirst()] = {call, told};
        else if (call >= 0)
            m_seen.append({call, told});
        else if (hasOneOf(told, m_plan.ignored))
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

    int first(const Call &call) const { return callOf(call.line.simplified().toUtf8()); }

    void compareCounts()
    {
        QMap<int, int> expected;
        QMap<int, QStringList> names;
        for (const Call &call : m_plan.calls) {
            expected[first(call)] += m_expected.times.value(call.name);
            names[first(call)].append(call.name);
        }
        for (auto each = expected.begin(); each != expected.end(); ++each) {
            QByteArray latest;
            int seen = 0;
            for (const Seen &call : m_seen) {
                seen += call.call == each.key() ? 1 : 0;
                latest = call.call == each.key() ? call.told : latest;
            }
            if (seen != *each)
                m_complaints.append(QStringLiteral("call %1: expected %2 times, seen %3 times %4")
                                        .arg(names.value(each.key()).join(QLatin1Char('/')))
                                        .arg(*each)
                                        .arg(seen)
                                        .arg(QString::fromUtf8(latest))
                                        .trimmed());
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
