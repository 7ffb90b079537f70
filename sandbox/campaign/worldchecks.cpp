// SPDX-License-Identifier: Apache-2.0
#include "campaign/worldchecks.h"

#include <QFile>
#include <QFileInfo>
#include <QJsonDocument>
#include <QJsonObject>
#include <QSet>

#include <algorithm>

namespace sandbox {

namespace {

const QString kAbsent = QStringLiteral("absent");
constexpr char kHeld[] = " is held ";
constexpr char kSettings[] = "/.config/glib-2.0/settings/keyfile";

QByteArray contentOf(const QString &path)
{
    QFile file(path);
    if (!QFileInfo(path).isFile())
        return {};
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

QString recordIn(const QByteArray &content)
{
    const QJsonValue joined = QJsonDocument::fromJson(content).object().value(QLatin1String("is_Domain"));
    if (!joined.isBool())
        return QStringLiteral("no record");
    return joined.toBool() ? QStringLiteral("record true") : QStringLiteral("record false");
}

// What a file holds, in the words of the tables.
QString kindOf(const StateFolder &state, const QString &path)
{
    const QByteArray content = contentOf(path);
    if (content.isEmpty())
        return QStringLiteral("empty");
    if (path.endsWith(QLatin1String("userinfo.json")))
        return recordIn(content);
    if (content == contentOf(state.at("server/ca.crt")))
        return QStringLiteral("ca");
    if (content.contains("PRIVATE KEY-----"))
        return QStringLiteral("key");
    return content.contains("BEGIN CERTIFICATE") ? QStringLiteral("certificate") : QStringLiteral("other");
}

// As the tables say it: a mode, a blank, and what a file holds.
QString seenAt(const StateFolder &state, const ViewFiles &files, const QString &path)
{
    const QString look = files.value(path).look;
    if (look.isEmpty())
        return kAbsent;
    return look.endsWith(QLatin1String(" file")) ? look.section(QLatin1Char(' '), 0, 0) + QLatin1Char(' ') +
                                                       kindOf(state, hostPath(state, path))
                                                 : look;
}

// "*" as a mode and "any" as a content stand for each there is.
bool fits(const QString &seen, const QString &expected)
{
    const QString mode = expected.section(QLatin1Char(' '), 0, 0);
    const QString kind = expected.section(QLatin1Char(' '), 1);
    return seen == expected ||
           (seen != kAbsent && (mode == QLatin1String("*") || seen.startsWith(mode + QLatin1Char(' '))) &&
            (kind == QLatin1String("any") || seen.endsWith(QLatin1Char(' ') + kind)));
}

// A directory on the way may be a link.
QString withoutLinks(const StateFolder &state, const QString &path)
{
    const QString root = QFileInfo(state.root()).canonicalFilePath();
    const QFileInfo host(hostPath(state, path));
    const QString folder = QFileInfo(host.path()).canonicalFilePath();
    return folder.startsWith(root) ? folder.mid(root.size()) + QLatin1Char('/') + host.fileName() : path;
}

// A pattern that ends in a slash stands for all that lies below.
bool isAlwaysAllowed(const QMap<QString, QString> &always, const QString &path, const QString &seen)
{
    for (auto each = always.begin(); each != always.end(); ++each) {
        const bool isMeant =
            each.key().endsWith(QLatin1Char('/')) ? path.startsWith(each.key()) : path == each.key();
        if (isMeant && fits(seen, *each))
            return true;
    }
    return false;
}

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

// The calls of a journal in the words of a plan. Two calls of a plan may look alike; the first stands for
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
        else if (told.contains(kHeld))
            hold(who.chopped(1));
        else if (!hasOneOf(told, m_plan.beside) &&
                 !(hasOneOf(told, m_plan.unheard) && m_expected.unheard-- > 0))
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
            if (call.isApart)
                earliest.insert(first(call), expected.size());
            else
                expected += QVector<int>(m_expected.times.value(call.name), first(call));
        }
        int next = 0;
        for (const Seen &call : m_seen) {
            if (call.call < 0)
                continue;
            const bool isApart = earliest.contains(call.call);
            const bool isInOrder =
                isApart ? earliest.value(call.call) <= next : expected.value(next, -1) == call.call;
            next += isApart ? 0 : 1;
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

QStringList worldchecks::files(const StateFolder &state, const ViewFiles &before,
                               const CampaignTables &tables, const QString &expected)
{
    const ViewFiles now = viewFiles(state);
    QStringList result;
    QSet<QString> named;
    const auto complain = [&](const QString &path, const QString &wanted, const QString &seen) {
        result.append(QStringLiteral("%1: expected %2, seen %3").arg(path, wanted, seen));
    };
    const QMap<QString, QString> files = tables.files(expected);
    for (auto file = files.begin(); file != files.end(); ++file) {
        const QString path = withoutLinks(state, file.key());
        const QString seen = seenAt(state, now, path);
        named.insert(path);
        if (!fits(seen, *file))
            complain(file.key(), *file, seen);
    }
    ViewFiles all = before;
    all.insert(now);
    for (const QString &path : all.keys()) {
        const ViewEntry was = before.value(path);
        const ViewEntry is = now.value(path);
        const bool isSame = was.look == is.look && (was.content.isEmpty() || was.content == is.content);
        if (isSame || named.contains(path) ||
            isAlwaysAllowed(tables.filesOfAll(), path, seenAt(state, now, path)))
            continue;
        complain(path, was.look.isEmpty() ? kAbsent : QStringLiteral("%1 as before").arg(was.look),
                 was.look == is.look ? QStringLiteral("other content") : seenAt(state, now, path));
    }
    return result;
}

QStringList worldchecks::settingsOf(const StateFolder &state)
{
    QStringList result;
    QString group;
    for (const QByteArray &line : contentOf(state.home() + QLatin1String(kSettings)).split('\n')) {
        if (line.startsWith('['))
            group =
                QString::fromUtf8(line).remove(QLatin1Char('[')).replace(QLatin1Char(']'), QLatin1Char('/'));
        else if (!line.isEmpty())
            result.append(group + QString::fromUtf8(line));
    }
    return result;
}

QStringList worldchecks::settings(const StateFolder &state, const QStringList &before,
                                  const JourneyPlan &plan)
{
    QStringList result;
    for (const QString &line : settingsOf(state)) {
        const bool isPlanned = std::any_of(plan.settings.begin(), plan.settings.end(),
                                           [&line](const QString &each) { return line.startsWith(each); });
        if (!isPlanned && !before.contains(line))
            result.append(QStringLiteral("setting not planned: %1").arg(line));
    }
    return result;
}

QStringList worldchecks::journal(const QByteArray &journal, const QStringList &expected)
{
    QStringList result;
    for (const QString &part : expected) {
        if (!journal.contains(part.toUtf8()))
            result.append(QStringLiteral("journal: expected \"%1\", not seen").arg(part));
    }
    return result;
}

QStringList worldchecks::log(const StateFolder &state, const QStringList &expected)
{
    const QByteArray text = contentOf(state.programLog());
    QStringList result;
    for (const QString &part : expected) {
        if (!text.contains(part.toUtf8()))
            result.append(QStringLiteral("program log: expected \"%1\", not seen").arg(part));
    }
    return result;
}

} // namespace sandbox
