// SPDX-License-Identifier: Apache-2.0
#include "campaign/report.h"

#include <QSaveFile>

#include <algorithm>

namespace sandbox {

namespace {

constexpr int kMostShown = 80; // characters of a box in a cell

// A text as Markdown shows it to the letter.
QString quotedBox(const QString &box)
{
    if (box.isEmpty())
        return QStringLiteral("a box without text");
    const QString shown = box.left(kMostShown)
                              .replace(QLatin1Char('\n'), QLatin1Char(' '))
                              .toHtmlEscaped()
                              .replace(QLatin1Char('|'), QStringLiteral("&#124;"));
    if (box.size() > kMostShown)
        return QStringLiteral("“%1…” (%2 characters)").arg(shown).arg(box.size());
    return QStringLiteral("“%1”").arg(shown);
}

QString quotedBoxes(const QStringList &boxes)
{
    QStringList quoted;
    for (const QString &box : boxes)
        quoted.append(quotedBox(box));
    return quoted.join(QStringLiteral(", then "));
}

QString closing(const Expectation &expect)
{
    static const QStringList ends{QString(), QStringLiteral("is killed"), QStringLiteral("is terminated"),
                                  QStringLiteral("ends")};
    if (expect.ending != Ending::None)
        return ends.at(static_cast<int>(expect.ending));
    return expect.mayClose ? QStringLiteral("may close") : QStringLiteral("refuses to close");
}

QString nextText(const NextAttempt &next)
{
    static const QStringList how{QStringLiteral("–"), QStringLiteral("pressed again"),
                                 QStringLiteral("started anew"), QStringLiteral("killed and started anew")};
    const QString &first = how.at(static_cast<int>(next.how));
    if (next.how == NextAttempt::How::None)
        return first;
    const QString after = next.boxes.isEmpty() ? QString() : QStringLiteral(", ") + quotedBoxes(next.boxes);
    return QStringLiteral("%1: page %2%3").arg(first, next.page, after);
}

// What a user sees of a row, as cells of a table.
QString cells(const Expectation &expect)
{
    return QStringLiteral("| %1 | %2 | %3 | %4 | ")
        .arg(expect.boxes.isEmpty() ? QStringLiteral("nothing") : quotedBoxes(expect.boxes), expect.page,
             closing(expect), nextText(expect.next));
}

} // namespace

Report::Report(QVector<RowResult> results)
    : m_results(std::move(results))
{
    // Rows lie in the order of the tables, results came in that of their ends.
    std::sort(m_results.begin(), m_results.end(),
              [](const RowResult &left, const RowResult &right) { return left.row < right.row; });
}

bool Report::write(const QString &path, QString *error) const
{
    QSaveFile file(path);
    if (file.open(QIODevice::WriteOnly) && file.write(text().toUtf8()) > 0 && file.commit())
        return true;
    *error = QStringLiteral("cannot write %1: %2").arg(path, file.errorString());
    return false;
}

QString Report::text() const
{
    QString text = QStringLiteral(
        "# Reliability\n\n"
        "What the program does when the world around it fails, row by row of the fault campaign. Made by\n"
        "`vesk-sandbox campaign --report docs/reliability.md`; how rows are written stands in "
        "`sandbox.md`.\n\n"
        "For each row the campaign also looked at every call of server, services and commands and their "
        "order, at\n"
        "all files, directories and settings that the program can write, at the program's log, at the "
        "process, and\n"
        "for passwords and keys in logs, files and arguments.\n\n");
    text += overview();
    for (const QString &group : groups())
        text += groupText(group);
    return text;
}

QString Report::overview() const
{
    QString text = QStringLiteral("| Group | Stages | Rows | Failed |\n|---|---|---|---|\n");
    for (const QString &group : groups()) {
        int rows = 0;
        int failed = 0;
        for (const RowResult &result : m_results) {
            rows += result.row->group == group ? 1 : 0;
            failed += result.row->group == group && !result.passed ? 1 : 0;
        }
        text += QStringLiteral("| %1 | %2 | %3 | %4 |\n")
                    .arg(group)
                    .arg(stagesOf(group).size())
                    .arg(rows)
                    .arg(failed);
    }
    return text;
}

QString Report::groupText(const QString &group) const
{
    QString text = QStringLiteral("\n## %1\n").arg(group);
    for (const QString &stage : stagesOf(group))
        text += stageText(group, stage);
    return text;
}

QString Report::stageText(const QString &group, const QString &stage) const
{
    QStringList order;
    QMap<QString, QStringList> faults;
    QStringList notes;
    for (const RowResult &result : m_results) {
        const Row &row = *result.row;
        if (row.group != group || row.stage != stage)
            continue;
        const QString seen = cells(row.expect);
        if (!faults.contains(seen))
            order.append(seen);
        faults[seen].append(result.passed ? row.fault : QStringLiteral("**%1 failed**").arg(row.fault));
        if (!row.note.isEmpty())
            notes.append(QStringLiteral("- %1: %2\n").arg(row.fault, row.note));
    }
    QString text =
        QStringLiteral("\n### %1\n\n| Message | Page at the end | Window | Next attempt | After |\n"
                       "|---|---|---|---|---|\n")
            .arg(stage);
    for (const QString &seen : order)
        text += seen + faults.value(seen).join(QStringLiteral(", ")) + QStringLiteral(" |\n");
    return notes.isEmpty() ? text : text + QLatin1Char('\n') + notes.join(QString());
}

QStringList Report::groups() const
{
    QStringList result;
    for (const RowResult &each : m_results)
        result.append(each.row->group);
    result.removeDuplicates();
    return result;
}

QStringList Report::stagesOf(const QString &group) const
{
    QStringList result;
    for (const RowResult &each : m_results) {
        if (each.row->group == group)
            result.append(each.row->stage);
    }
    result.removeDuplicates();
    return result;
}

} // namespace sandbox
