// SPDX-License-Identifier: Apache-2.0
#include "campaign/rows.h"

#include "journal/smallfile.h"
#include "scenario/json.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>

namespace sandbox {

namespace {

Row rowIn(const QByteArray &line)
{
    const QJsonObject row = QJsonDocument::fromJson(line).object();
    return {json::text(row, "id"), json::text(row, "note"), json::flag(row, "fast"),
            json::object(row, "scenario")};
}

} // namespace

Rows Rows::load(const QString &file)
{
    Rows rows;
    const QString installed =
        QCoreApplication::applicationDirPath() + QLatin1String("/../share/vesk-sandbox/rows.jsonl");
    rows.m_lines = smallfile::load(file.isEmpty() ? installed : file).trimmed().split('\n');
    rows.m_head = QJsonDocument::fromJson(rows.m_lines.takeFirst()).object();
    return rows;
}

QVector<Row> Rows::all() const
{
    QVector<Row> rows;
    for (const QByteArray &line : m_lines)
        rows.append(rowIn(line));
    return rows;
}

std::optional<Row> Rows::find(const QString &name) const
{
    if (name.endsWith(QLatin1String(".json")))
        return Row{QFileInfo(name).completeBaseName(), {}, false, Scenario::load(name).json()};
    for (const QString &id : {otherNames().value(name).toString(name), QStringLiteral("scenarios/") + name}) {
        for (const QByteArray &line : m_lines) {
            if (line.startsWith("{\"id\": \"" + id.toUtf8() + '"'))
                return rowIn(line);
        }
    }
    return std::nullopt;
}

JourneyPlan Rows::journey(const QString &name, const Placeholders &values) const
{
    const QJsonObject object = part("journeys").value(name).toObject();
    JourneyPlan plan;
    for (const QJsonValue &each : json::array(object, "calls")) {
        const QJsonObject call = each.toObject();
        plan.calls.append({json::text(call, "name"), values.filled(json::text(call, "line")).simplified(),
                           json::flag(call, "detached")});
    }
    plan.members = json::texts(object, "members");
    for (const QString &program : json::texts(object, "programs"))
        plan.programs.append(values.filled(program));
    for (const QString &peer : json::texts(object, "peers"))
        plan.peers.append(values.filled(peer));
    plan.ignored = json::texts(object, "ignored");
    plan.incomplete = json::texts(object, "incomplete");
    return plan;
}

} // namespace sandbox
