// SPDX-License-Identifier: Apache-2.0
#include "campaign/report.h"

#include "scenario/json.h"

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

QString closing(const QJsonObject &expect)
{
    static const QMap<QString, QString> ends{{QStringLiteral("killed"), QStringLiteral("is killed")},
                                             {QStringLiteral("terminated"), QStringLiteral("is terminated")},
                                             {QStringLiteral("display-lost"), QStringLiteral("ends")}};
    const bool isRefused = json::text(expect, "close") == QLatin1String("refused");
    return ends.value(json::text(expect, "ends"),
                      isRefused ? QStringLiteral("refuses to close") : QStringLiteral("may close"));
}

QString nextText(const QJsonObject &expect)
{
    static const QMap<QString, QString> how{
        {QStringLiteral("press"), QStringLiteral("pressed again")},
        {QStringLiteral("start"), QStringLiteral("started again")},
        {QStringLiteral("kill"), QStringLiteral("killed and started again")}};
    const QString first = how.value(json::text(expect, "next"));
    if (first.isEmpty())
        return QStringLiteral("–");
    const QString boxes = quotedBoxes(json::texts(expect, "next_messages"));
    return QStringLiteral("%1: page %2%3")
        .arg(first, json::text(expect, "next_page"), boxes.isEmpty() ? boxes : QStringLiteral(", ") + boxes);
}

// What a user sees of a row, as cells of a table.
QString cells(const QJsonObject &expect)
{
    const QString boxes = quotedBoxes(json::texts(expect, "messages"));
    return QStringLiteral("| %1 | %2 | %3 | %4 | ")
        .arg(boxes.isEmpty() ? QStringLiteral("nothing") : boxes, json::text(expect, "page"), closing(expect),
             nextText(expect));
}

} // namespace

Report::Report(const CampaignTables &tables, const TestResults &results)
{
    for (const Row &row : tables.rows()) {
        const auto result = results.passed.find(QStringLiteral("campaign/") + row.id());
        if (result == results.passed.end())
            continue;
        if (!*result)
            m_failed.insert(row.id());
        if (m_stages.isEmpty() || m_stages.last().first()->stage != row.stage ||
            m_stages.last().first()->group != row.group)
            m_stages.append(QVector<const Row *>());
        m_stages.last().append(&row);
    }
}

QString Report::text() const
{
    QString text = QStringLiteral(
        "# Reliability\n\n"
        "What the program does when the world around it fails, row by row of the fault campaign. Made by\n"
        "`tools/campaign`; how rows are written stands in `sandbox.md`.\n\n"
        "For each row the campaign also looked at every call of server, services and commands and their "
        "order, at\n"
        "all files, directories and settings that the program can write, at the program's log, at the "
        "process, and\n"
        "for passwords and keys in logs, files and arguments.\n\n");
    text += overview();
    QString group;
    for (const auto &stage : m_stages) {
        if (stage.first()->group != group)
            text += QStringLiteral("\n## %1\n").arg(stage.first()->group);
        group = stage.first()->group;
        text += stageText(stage);
    }
    return text;
}

QString Report::overview() const
{
    struct Count
    {
        int stages = 0;
        int rows = 0;
        int failed = 0;
    };
    QMap<QString, Count> counts;
    for (const auto &stage : m_stages) {
        Count &count = counts[stage.first()->group];
        ++count.stages;
        count.rows += stage.size();
        for (const Row *row : stage)
            count.failed += m_failed.contains(row->id()) ? 1 : 0;
    }
    QString text = QStringLiteral("| Group | Stages | Rows | Failed |\n|---|---|---|---|\n");
    for (auto count = counts.begin(); count != counts.end(); ++count)
        text += QStringLiteral("| %1 | %2 | %3 | %4 |\n")
                    .arg(count.key())
                    .arg(count->stages)
                    .arg(count->rows)
                    .arg(count->failed);
    return text;
}

QString Report::stageText(const QVector<const Row *> &rows) const
{
    QStringList order;
    QMap<QString, QStringList> faults;
    QString notes;
    for (const Row *row : rows) {
        const QString seen = cells(json::object(row->scenario, "expect"));
        if (!faults.contains(seen))
            order.append(seen);
        faults[seen].append(m_failed.contains(row->id()) ? QStringLiteral("**%1 failed**").arg(row->fault)
                                                         : row->fault);
        if (!row->note.isEmpty())
            notes += QStringLiteral("- %1: %2\n").arg(row->fault, row->note);
    }
    QString text =
        QStringLiteral("\n### %1\n\n| Message | Page at the end | Window | Next attempt | After |\n"
                       "|---|---|---|---|---|\n")
            .arg(rows.first()->stage);
    for (const QString &seen : order)
        text += seen + faults.value(seen).join(QStringLiteral(", ")) + QStringLiteral(" |\n");
    return notes.isEmpty() ? text : text + QLatin1Char('\n') + notes;
}

} // namespace sandbox
