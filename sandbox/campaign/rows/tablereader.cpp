// SPDX-License-Identifier: Apache-2.0
#include "campaign/rows/tablereader.h"

#include "campaign/rows/faultscenario.h"
#include "scenario/json.h"

#include <QJsonArray>

#include <algorithm>

namespace sandbox {

namespace {

const QString kLike = QStringLiteral("like");

QMap<QString, QString> textsIn(const QJsonObject &object)
{
    QMap<QString, QString> result;
    for (auto entry = object.begin(); entry != object.end(); ++entry)
        result.insert(entry.key(), entry.value().toString());
    return result;
}

// What a state says, laid over what it is like; null takes a path out.
QMap<QString, QString> filesOf(const QJsonObject &states, const QString &name, int depth)
{
    QJsonObject state = states.value(name).toObject();
    const QString like = state.take(kLike).toString();
    if (!like.isEmpty() && (!states.contains(like) || depth > states.size()))
        throw TableError{QStringLiteral("\"states.%1.like\" names no other state").arg(name)};
    QMap<QString, QString> files =
        like.isEmpty() ? QMap<QString, QString>() : filesOf(states, like, depth + 1);
    for (auto file = state.begin(); file != state.end(); ++file) {
        if (file.value().isNull())
            files.remove(file.key());
        else
            files.insert(file.key(), file.value().toString());
    }
    return files;
}

// A word about the message boxes takes the place of one of the other form.
QJsonObject outcomeOver(QJsonObject base, const QJsonObject &patch)
{
    for (const char *prefix : {"", "next_"}) {
        const QString one = QLatin1String(prefix) + QStringLiteral("message");
        const QString several = one + QLatin1Char('s');
        if (patch.contains(one) || patch.contains(several)) {
            base.remove(one);
            base.remove(several);
        }
    }
    return json::overlaid(base, patch);
}

// All boxes under the one key.
void gatherMessages(QJsonObject *expect, const QString &one)
{
    const QString several = one + QLatin1Char('s');
    if (expect->contains(one))
        expect->insert(several, QJsonArray{expect->take(one)});
    else if (!expect->contains(several))
        expect->insert(several, QJsonArray());
}

bool names(const QJsonArray &objects, const QString &name)
{
    return std::any_of(objects.begin(), objects.end(), [&name](const QJsonValue &each) {
        return json::text(each.toObject(), "name") == name;
    });
}

JourneyPlan planIn(const QJsonObject &object)
{
    JourneyPlan plan;
    plan.settings = json::texts(object, "settings");
    plan.stops = json::object(object, "stops");
    plan.pages = json::texts(object, "pages");
    plan.end = json::object(object, "end");
    for (const QJsonValue &each : json::array(object, "calls")) {
        const QJsonObject call = each.toObject();
        plan.calls.append({json::text(call, "name"), json::text(call, "page"), json::text(call, "line"),
                           json::flag(call, "optional"), json::flag(call, "apart")});
    }
    return plan;
}

} // namespace

void TableReader::readJourneys(const QJsonObject &top, CampaignTables &tables)
{
    for (const char *name : {"join", "leave"}) {
        JourneyPlan plan = planIn(json::object(top, name));
        plan.beside = json::texts(top, "beside");
        plan.unheard = json::texts(top, "unheard");
        tables.m_journeys.insert(QLatin1String(name), plan);
    }
    tables.m_wider = json::object(top, "wider");
}

void TableReader::readFiles(const QJsonObject &top, CampaignTables &tables)
{
    const QJsonObject states = json::object(top, "states");
    for (const QString &state : states.keys())
        tables.m_files.insert(state, filesOf(states, state, 0));
    tables.m_filesOfAll = textsIn(json::object(top, "always"));
}

void TableReader::readNames(const QJsonObject &top, CampaignTables &tables)
{
    tables.m_otherNames = textsIn(top);
    for (auto name = tables.m_otherNames.begin(); name != tables.m_otherNames.end(); ++name) {
        if (tables.row(*name) == nullptr)
            throw TableError{QStringLiteral("\"%1\" names the unknown row \"%2\"").arg(name.key(), *name)};
    }
}

void TableReader::read(const QJsonObject &top)
{
    const QJsonArray stages = json::array(top, "stages");
    QJsonObject exceptions = json::object(top, "exceptions");
    m_isEachOutcomeFast = json::text(top, "fast") == QLatin1String("each-outcome");
    for (const QJsonValue &each : json::array(top, "faults")) {
        const QJsonObject fault = each.toObject();
        for (const QString &name : json::texts(fault, "only") + json::texts(fault, "fast")) {
            if (!names(stages, name))
                throw TableError{QStringLiteral("the fault \"%1\" names the unknown stage \"%2\"")
                                     .arg(json::text(fault, "name"), name)};
        }
    }
    for (const QJsonValue &eachStage : stages) {
        const QJsonObject stage = eachStage.toObject();
        const QString name = json::text(stage, "name");
        for (const QJsonValue &eachFault : json::array(top, "faults")) {
            const QJsonObject fault = eachFault.toObject();
            const QStringList only = json::texts(fault, "only");
            if (only.isEmpty() || only.contains(name))
                addRow(stage, fault,
                       exceptions.take(name + QLatin1Char('/') + json::text(fault, "name")).toObject());
        }
    }
    if (!exceptions.isEmpty())
        throw TableError{
            QStringLiteral("\"exceptions.%1\" belongs to no row").arg(exceptions.keys().first())};
}

// An exception may say "skip": true, and must say why in "note".
void TableReader::addRow(const QJsonObject &stage, const QJsonObject &fault, QJsonObject exception)
{
    Row row{m_group,
            json::text(stage, "name"),
            json::text(fault, "name"),
            json::text(exception, "note"),
            json::texts(fault, "fast").contains(json::text(stage, "name")),
            {}};
    if (!exception.isEmpty() && row.note.isEmpty())
        throw TableError{
            QStringLiteral("\"exceptions.%1/%2\" has no \"note\" that says why").arg(row.stage, row.fault)};
    if (json::flag(exception, "skip"))
        return;
    exception.remove(QStringLiteral("note"));
    if (m_tables.row(row.id()) != nullptr)
        throw TableError{QStringLiteral("there are two rows %1").arg(row.id())};
    const QString name = outcomeName(stage, fault);
    if (m_isEachOutcomeFast && !m_outcomes.contains(row.stage + QLatin1Char('/') + name)) {
        m_outcomes.insert(row.stage + QLatin1Char('/') + name);
        row.isFast = true;
    }
    row.scenario =
        json::overlaid(json::object(stage, "scenario"), faultScenario(stage, json::object(fault, "does")));
    row.scenario.insert(QStringLiteral("title"), fault.value(QLatin1String("title")));
    row.scenario.insert(QStringLiteral("journey"), stage.value(QLatin1String("journey")));
    row.scenario.insert(QStringLiteral("prepare"),
                        json::overlaid(json::object(stage, "prepare"), json::object(fault, "prepare")));
    row.scenario.insert(QStringLiteral("start"), json::object(fault, "start"));
    row.scenario.insert(QStringLiteral("needs"), json::array(fault, "needs"));
    row.scenario.insert(QStringLiteral("actions"), actions(stage, fault));
    const QJsonObject outcome =
        outcomeOver(outcomeOver(json::object(json::object(stage, "outcomes"), name.toLatin1().constData()),
                                json::object(fault, "expect")),
                    exception);
    row.scenario.insert(QStringLiteral("expect"), expectation(stage, fault, outcome));
    for (const QString &key : row.scenario.keys()) { // what says nothing
        const QJsonValue value = row.scenario.value(key);
        if (value == QJsonObject() || value == QJsonArray())
            row.scenario.remove(key);
    }
    m_tables.m_rows.append(row);
}

// The class of the stage's outcome for the fault: "like" leads to another one, and a class without an outcome
// of its own comes out like a wider one.
QString TableReader::outcomeName(const QJsonObject &stage, const QJsonObject &fault) const
{
    const QJsonObject outcomes = json::object(stage, "outcomes");
    QSet<QString> tried;
    QString name = json::text(fault, "class");
    while (!name.isEmpty() && !tried.contains(name)) {
        tried.insert(name);
        const QJsonObject outcome = outcomes.value(name).toObject();
        if (outcomes.contains(name) && !outcome.contains(kLike))
            return name;
        name = outcomes.contains(name) ? outcome.value(kLike).toString()
                                       : m_tables.m_wider.value(name).toString();
    }
    throw TableError{
        QStringLiteral("stage \"%1\" has no outcome for the class \"%2\" of the fault \"%3\"")
            .arg(json::text(stage, "name"), json::text(fault, "class"), json::text(fault, "name"))};
}

// The moments of a stage in the words of its journal.
QJsonArray TableReader::actions(const QJsonObject &stage, const QJsonObject &fault) const
{
    QJsonArray result;
    for (const QJsonArray &list : {json::array(stage, "actions"), json::array(fault, "actions")}) {
        for (const QJsonValue &each : list) {
            QJsonObject action = each.toObject();
            QString moment =
                json::text(action, "on").replace(QLatin1String("@before"), json::text(stage, "before"));
            for (const Call &call : m_tables.journey(json::text(stage, "journey")).calls) {
                if (call.name == json::text(stage, "call"))
                    moment.replace(QLatin1String("@call"), call.line);
            }
            action.insert(QStringLiteral("on"), moment);
            result.append(action);
        }
    }
    return result;
}

// What is not said of the next attempt stays as it is, or is as at the end of the journey.
QJsonObject TableReader::expectation(const QJsonObject &stage, const QJsonObject &fault,
                                     const QJsonObject &outcome) const
{
    const JourneyPlan plan = m_tables.journey(json::text(stage, "journey"));
    const bool goesOn = json::flag(outcome, "goes_on");
    QJsonObject expect = outcomeOver(goesOn ? plan.end : json::object(stage, "stop"), outcome);
    const bool isHeard = json::flag(fault, "seen", true);
    const bool isSeen = json::flag(expect, "seen", isHeard);
    expect.remove(QStringLiteral("goes_on"));
    expect.remove(QStringLiteral("seen"));
    gatherMessages(&expect, QStringLiteral("message"));
    gatherMessages(&expect, QStringLiteral("next_message"));
    QStringList messages = json::texts(expect, "messages");
    messages.replaceInStrings(QStringLiteral("@msg"), wordsOf(stage, json::object(fault, "does")));
    expect.insert(QStringLiteral("messages"), QJsonArray::fromStringList(messages));
    expect.insert(QStringLiteral("asked"), calls(stage, isSeen, goesOn, json::object(expect, "asked")));
    expect.insert(QStringLiteral("unheard"), isSeen && isHeard ? 0 : 1);
    expect.insert(QStringLiteral("with"), json::array(stage, "with"));

    const auto byDefault = [&expect](const char *key, const QJsonValue &value) {
        if (!expect.contains(QLatin1String(key)))
            expect.insert(QLatin1String(key), value);
    };
    byDefault("close", QStringLiteral("possible"));
    const bool mayClose = json::text(expect, "close") == QLatin1String("possible");
    byDefault("next", goesOn     ? QStringLiteral("none")
                      : mayClose ? QStringLiteral("start")
                                 : QStringLiteral("press"));
    byDefault("next_journey", stage.value(QLatin1String("journey")));
    const JourneyPlan next = m_tables.journey(json::text(expect, "next_journey"));
    byDefault("next_page", next.end.value(QLatin1String("page")));
    byDefault("next_files", next.end.value(QLatin1String("files")));
    const QStringList last =
        json::texts(expect, "next_messages").mid(json::texts(expect, "next_messages").size() - 1);
    if (!last.isEmpty() && !next.stops.contains(last.first()))
        throw TableError{QStringLiteral("stage \"%1\": \"next_message\" is none of the journey's stops")
                             .arg(json::text(stage, "name"))};
    for (const char *key : {"files", "next_files"}) {
        if (!m_tables.m_files.contains(json::text(expect, key)))
            throw TableError{
                QStringLiteral("stage \"%1\": \"%2\" names the unknown state \"%3\"")
                    .arg(json::text(stage, "name"), QLatin1String(key), json::text(expect, key))};
    }
    return expect;
}

// Up to the stage each call is made once, after it none, unless the journey goes on.
QJsonObject TableReader::calls(const QJsonObject &stage, bool isSeen, bool goesOn,
                               const QJsonObject &differing) const
{
    QJsonObject times;
    bool isOver = false;
    for (const Call &call : m_tables.journey(json::text(stage, "journey")).calls) {
        const bool isStage = call.name == json::text(stage, "call");
        const bool isMade = !isOver && (!call.isOptional || json::texts(stage, "with").contains(call.name));
        times.insert(call.name, isMade && (isSeen || !isStage) ? 1 : 0);
        isOver = isOver || (isStage && !goesOn);
    }
    if (!times.contains(json::text(stage, "call")))
        throw TableError{QStringLiteral("stage \"%1\": the journey has no call \"%2\"")
                             .arg(json::text(stage, "name"), json::text(stage, "call"))};
    for (const QString &name : differing.keys()) {
        if (!times.contains(name))
            throw TableError{QStringLiteral("stage \"%1\": the journey has no call \"%2\"")
                                 .arg(json::text(stage, "name"), name)};
    }
    return json::overlaid(times, differing);
}

} // namespace sandbox
