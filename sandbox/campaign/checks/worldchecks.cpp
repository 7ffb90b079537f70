// SPDX-License-Identifier: Apache-2.0
#include "campaign/checks/worldchecks.h"

#include "journal/smallfile.h"
#include "state/userunits.h"

#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QSet>

#include <algorithm>

namespace sandbox {

namespace {

const QString kAbsent = QStringLiteral("absent");
constexpr char kSettings[] = "/.config/glib-2.0/settings/keyfile";

QByteArray contentOf(const QString &path)
{
    return QFileInfo(path).isFile() ? smallfile::read(path).value_or(QByteArray()) : QByteArray();
}

// What a file holds, in the words of the tables.
class ContentKinds
{
public:
    ContentKinds(const StateDirectory &state, const Rows &rows, const QVector<Placeholders> &attempts)
        : m_state(state)
        , m_journal(contentOf(state.journal().path()))
    {
        const QJsonObject records = rows.records();
        for (const Placeholders &values : attempts) {
            for (auto record = records.begin(); record != records.end(); ++record)
                m_records.insert(values.filled(record.value().toString()), record.key());
        }
    }

    QString kindOf(const QString &path) const
    {
        const QString host = hostPath(m_state, path);
        const QByteArray content = contentOf(host);
        if (content.isEmpty())
            return QStringLiteral("empty");
        if (path.endsWith(QLatin1String("userinfo.json")))
            return m_records.value(QString::fromUtf8(content),
                                   QStringLiteral("record %1").arg(QString::fromUtf8(content.simplified())));
        if (content == contentOf(m_state.at("server/ca.crt")))
            return QStringLiteral("ca");
        for (const char *kind : {"key", "cert"}) {
            const QString told =
                QStringLiteral("\"%1\":\"<sha256 %2>\"").arg(QLatin1String(kind), contentHash(host));
            if (m_journal.contains(told.toUtf8()))
                return QLatin1String(kind);
        }
        return QStringLiteral("other");
    }

private:
    const StateDirectory &m_state;
    QByteArray m_journal;
    QMap<QString, QString> m_records; // their names by their content
};

// As in the tables: a mode, a blank, and what a file holds.
QString seenAt(const ContentKinds &kinds, const ViewFiles &files, const QString &path)
{
    const QString look = files.value(path).look;
    if (look.isEmpty())
        return kAbsent;
    return look.endsWith(QLatin1String(" file"))
               ? look.section(QLatin1Char(' '), 0, 0) + QLatin1Char(' ') + kinds.kindOf(path)
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
QString withoutLinks(const StateDirectory &state, const QString &path)
{
    const QString root = QFileInfo(state.root()).canonicalFilePath();
    const QFileInfo host(hostPath(state, path));
    const QString parent = QFileInfo(host.path()).canonicalFilePath();
    return parent.startsWith(root) ? parent.mid(root.size()) + QLatin1Char('/') + host.fileName() : path;
}

// A pattern that ends in a slash stands for everything below.
bool isAlwaysAllowed(const QJsonObject &always, const QString &path, const QString &seen)
{
    for (auto each = always.begin(); each != always.end(); ++each) {
        const bool isMeant =
            each.key().endsWith(QLatin1Char('/')) ? path.startsWith(each.key()) : path == each.key();
        if (isMeant && fits(seen, each.value().toString()))
            return true;
    }
    return false;
}

bool isKnown(const StateDirectory &state)
{
    const QString id =
        QString::fromUtf8(contentOf(state.inside(QStringLiteral("/usr/share/vesk/machine.txt"))).trimmed());
    const QJsonArray terminals = smallfile::readObject(state.at("server/config.json"))
                                     .value(QLatin1String("known_terminals"))
                                     .toArray();
    return std::any_of(terminals.begin(), terminals.end(), [&id](const QJsonValue &each) {
        return each.toObject().value(QLatin1String("machine_id")).toString() == id;
    });
}

bool hasIdentity(const StateDirectory &state)
{
    return smallfile::readObject(state.identityService()).value(QLatin1String("Enable")).toBool();
}

bool hasServices(const StateDirectory &state)
{
    const UserUnits units(state);
    const QStringList names = UserUnits::names();
    return std::all_of(names.begin(), names.end(),
                       [&units](const QString &unit) { return units.isEnabled(unit); });
}

} // namespace

QStringList worldchecks::files(const StateDirectory &state, const ViewFiles &before, const Rows &rows,
                               const QString &expected, const QVector<Placeholders> &attempts)
{
    const ViewFiles now = viewFiles(state);
    const ContentKinds kinds(state, rows, attempts);
    QStringList result;
    QSet<QString> named;
    const auto complain = [&](const QString &path, const QString &wanted, const QString &seen) {
        result.append(QStringLiteral("%1: expected %2, seen %3").arg(path, wanted, seen));
    };
    const QJsonObject files = rows.files(expected);
    for (auto file = files.begin(); file != files.end(); ++file) {
        const QString path = withoutLinks(state, file.key());
        const QString seen = seenAt(kinds, now, path);
        named.insert(path);
        const QString wanted = file.value().toString();
        if (!fits(seen, wanted))
            complain(file.key(), wanted, seen);
    }
    ViewFiles all = before;
    all.insert(now);
    for (const QString &path : all.keys()) {
        const ViewEntry was = before.value(path);
        const ViewEntry is = now.value(path);
        const bool isSame = (was.look == is.look && (was.content.isEmpty() || was.content == is.content)) ||
                            (was.isTemporary && is.look.isEmpty());
        if (isSame || named.contains(path) ||
            isAlwaysAllowed(rows.filesOfAll(), path, seenAt(kinds, now, path)))
            continue;
        complain(path, was.look.isEmpty() ? kAbsent : QStringLiteral("%1 as before").arg(was.look),
                 was.look == is.look ? QStringLiteral("other content") : seenAt(kinds, now, path));
    }
    return result;
}

QStringList worldchecks::settingsOf(const StateDirectory &state)
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

QStringList worldchecks::settings(const StateDirectory &state, const QStringList &before,
                                  const QStringList &expected)
{
    const QStringList seen = settingsOf(state);
    QStringList result;
    for (const QString &line : expected) {
        if (!seen.contains(line))
            result.append(QStringLiteral("setting expected, not seen: %1").arg(line));
    }
    for (const QString &line : seen) {
        if (!expected.contains(line) && !before.contains(line))
            result.append(QStringLiteral("setting not planned: %1").arg(line));
    }
    return result;
}

QStringList worldchecks::texts(const char *what, const QString &path, const QStringList &expected)
{
    const QByteArray text = contentOf(path);
    QStringList result;
    for (const QString &part : expected) {
        if (!text.contains(part.toUtf8()))
            result.append(QStringLiteral("%1: expected \"%2\", not seen").arg(QLatin1String(what), part));
    }
    return result;
}

bool worldchecks::isIdle(const QByteArray &journal)
{
    int atWork = 0;
    int held = 0;
    for (const QByteArray &line : journal.split('\n')) {
        const bool isAnswer = line.contains(" server    reply ") || line.contains(" server    fault ");
        const bool isHeld = line.endsWith(" is held for now");
        atWork += line.contains(" server    request ") ? 1 : 0;
        if (isAnswer)
            --(isHeld || held == 0 ? atWork : held);
        held += isAnswer && isHeld ? 1 : 0;
    }
    return atWork <= 0;
}

QStringList worldchecks::world(const StateDirectory &state, const QJsonObject &expected)
{
    QStringList result;
    const auto compare = [&](const char *key, bool (*look)(const StateDirectory &)) {
        const bool seen = look(state);
        const bool wanted = json::flag(expected, key);
        if (wanted != seen)
            result.append(QStringLiteral("world, %1: expected %2, seen %3")
                              .arg(QLatin1String(key))
                              .arg(wanted)
                              .arg(seen));
    };
    compare("known", isKnown);
    compare("identity", hasIdentity);
    compare("services", hasServices);
    return result;
}

QStringList worldchecks::walk(const QString &page, const QStringList &messages, const QByteArray &journal)
{
    QString lastPage = QStringLiteral("none");
    QStringList seen;
    for (const QByteArray &line : journal.split('\n')) {
        const QString told = QString::fromUtf8(line).section(QStringLiteral(" autopilot "), 1);
        const QString name = told.section(QLatin1Char(' '), 1, 1, QString::SectionSkipEmpty);
        if (told.startsWith(QLatin1String("page ")) && name != QLatin1String("progress") &&
            name != QLatin1String("authorise"))
            lastPage = name;
        else if (told.startsWith(QLatin1String("message ")))
            seen.append(told.section(QLatin1Char('"'), 1, -2));
    }
    QStringList result;
    const bool isBefore = lastPage == QLatin1String("leave") || lastPage == QLatin1String("summary");
    if (lastPage != page && !(page == QLatin1String("progress") && isBefore))
        result.append(QStringLiteral("expected page %1, seen %2").arg(page, lastPage));
    if (seen != messages)
        result.append(QStringLiteral("expected the messages \"%1\", seen \"%2\"")
                          .arg(messages.join(QLatin1String("\", \"")), seen.join(QLatin1String("\", \""))));
    return result;
}

} // namespace sandbox
