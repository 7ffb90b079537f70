// SPDX-License-Identifier: Apache-2.0
#include "campaign/tablesreader.h"

#include "campaign/overlay.h"
#include "campaign/programstart.h"
#include "campaign/rowneeds.h"
#include "campaign/tableparts.h"
#include "scenario/strictobject.h"

#include <algorithm>

namespace sandbox {

namespace {

constexpr int kMostAsked = 100;

QStringList list(const char *words)
{
    return QString::fromLatin1(words).split(QLatin1Char(' '));
}

const QString kLike = QStringLiteral("like");
const QStringList kEndings{QStringLiteral("killed"), QStringLiteral("terminated"),
                           QStringLiteral("display-lost")};

Ending endingOf(const QString &word)
{
    return static_cast<Ending>(kEndings.indexOf(word) + 1);
}

NextAttempt::How howOf(const QString &word)
{
    return static_cast<NextAttempt::How>(list("none press start kill").indexOf(word));
}

QStringList boxesIn(StrictObject &object, const char *one, const char *many)
{
    const auto text = object.text(one);
    const auto texts = object.texts(many);
    if (text && texts)
        object.refuse(QLatin1String(one), QStringLiteral("stands beside \"%1\"").arg(QLatin1String(many)));
    return text ? QStringList{*text} : texts.value_or(QStringList());
}

// Every name must be that of a stage.
void refuseStrangers(const StrictObject &top, const TableFault &fault, const QVector<TableStage> &stages)
{
    for (const QString &name : fault.only + fault.fast) {
        const bool isKnown = std::any_of(stages.begin(), stages.end(),
                                         [&name](const TableStage &each) { return each.name == name; });
        if (!isKnown)
            top.refuse(QStringLiteral("faults.") + fault.name,
                       QStringLiteral("names the unknown stage \"%1\"").arg(name));
    }
}

// What a state says, laid over what it is like.
QMap<QString, QString> filesOf(const StrictObject &top, const QMap<QString, QJsonObject> &states,
                               const QString &name, int depth)
{
    QJsonObject state = states.value(name);
    const QString like = state.take(kLike).toString();
    if (!like.isEmpty() && (!states.contains(like) || depth > states.size()))
        top.refuse(QStringLiteral("states.%1.like").arg(name), QStringLiteral("names no other state"));
    QMap<QString, QString> files =
        like.isEmpty() ? QMap<QString, QString>() : filesOf(top, states, like, depth + 1);
    for (auto file = state.begin(); file != state.end(); ++file) {
        const QString look = file.value().toString();
        if (look == QLatin1String("as before"))
            files.remove(file.key());
        else if (look == QLatin1String("absent") || look.contains(QLatin1Char(' ')))
            files.insert(file.key(), look);
        else
            top.refuse(QStringLiteral("states.%1.%2").arg(name, file.key()),
                       QStringLiteral("is not a mode and a content"));
    }
    return files;
}

} // namespace

void TablesReader::readJourneys(StrictObject &top, CampaignTables &tables)
{
    const QStringList beside = top.texts("beside").value_or(QStringList());
    const QStringList unheard = top.texts("unheard").value_or(QStringList());
    for (const char *name : {"join", "leave"}) {
        top.inside(name, [&](StrictObject &object) {
            JourneyPlan plan;
            plan.beside = beside;
            plan.unheard = unheard;
            plan.settings = object.texts("settings").value_or(QStringList());
            const QJsonObject stops = object.object("stops").value_or(QJsonObject());
            for (auto stop = stops.begin(); stop != stops.end(); ++stop)
                plan.stops.insert(stop.key(), stop.value().toString());
            plan.pages = object.texts("pages").value_or(QStringList());
            plan.end = object.object("end").value_or(QJsonObject());
            object.forEach("calls", [&](StrictObject &inner) {
                plan.calls.append({requiredText(inner, "name"), requiredText(inner, "page"),
                                   requiredText(inner, "line"), inner.flag("optional").value_or(false),
                                   inner.flag("apart").value_or(false)});
            });
            tables.m_journeys.insert(QLatin1String(name), plan);
        });
    }
    top.refuseOthers();
}

void TablesReader::readFiles(StrictObject &top, CampaignTables &tables)
{
    const auto states = objectsIn(top, "states");
    for (auto state = states.begin(); state != states.end(); ++state)
        tables.m_files.insert(state.key(), filesOf(top, states, state.key(), 0));
    const QJsonObject always = top.object("always").value_or(QJsonObject());
    for (auto file = always.begin(); file != always.end(); ++file)
        tables.m_filesOfAll.insert(file.key(), file.value().toString());
    top.refuseOthers();
}

void TablesReader::read(StrictObject &top)
{
    QVector<TableStage> stages;
    top.forEach("stages", [&](StrictObject &object) { stages.append(readStage(object)); });
    QVector<TableFault> faults;
    top.forEach("faults", [&](StrictObject &object) { faults.append(readFault(object)); });
    QMap<QString, QJsonObject> exceptions = objectsIn(top, "exceptions");
    top.refuseOthers();
    for (const TableFault &fault : faults)
        refuseStrangers(top, fault, stages);
    for (const TableStage &stage : stages) {
        for (const TableFault &fault : faults) {
            if (fault.only.isEmpty() || fault.only.contains(stage.name))
                addRow(stage, fault, exceptions.take(stage.name + QLatin1Char('/') + fault.name));
        }
    }
    if (!exceptions.isEmpty())
        top.refuse(QStringLiteral("exceptions.") + exceptions.firstKey(),
                   QStringLiteral("belongs to no row"));
}

// An exception may say "skip": true, and must say why in "note".
void TablesReader::addRow(const TableStage &stage, const TableFault &fault, const QJsonObject &exception)
{
    Row row;
    row.group = m_group;
    row.stage = stage.name;
    row.fault = fault.name;
    row.title = fault.title;
    row.journey = stage.journey;
    row.with = stage.with;
    row.isFast = fault.fast.contains(stage.name);
    QJsonObject differs = exception;
    row.note = differs.take(QStringLiteral("note")).toString();
    const bool isSkipped = differs.take(QStringLiteral("skip")).toBool();
    if (!exception.isEmpty() && row.note.isEmpty())
        throw JsonTrouble{
            QStringLiteral("\"exceptions.%1/%2\" has no \"note\" that says why").arg(stage.name, fault.name)};
    if (isSkipped)
        return;
    if (m_tables.row(row.id()) != nullptr)
        throw JsonTrouble{QStringLiteral("there are two rows %1").arg(row.id())};
    row.scenario = overlaid(stage.scenario, faultScenario(stage.place, fault.does, row.id()));
    row.prepare = overlaid(stage.prepare, fault.prepare);
    row.start = overlaid(stage.start, fault.start);
    row.needs = stage.needs + fault.needs;
    programStart(row.start, {}, {}); // refuses what it does not know
    for (const QString &need : row.needs) {
        if (!rowneeds::names().contains(need))
            throw JsonTrouble{
                QStringLiteral("\"%1/%2\" needs the unknown \"%3\"").arg(stage.name, fault.name, need)};
    }
    row.actions = stage.actions + fault.actions;
    for (Action &action : row.actions)
        action.on = filledIn(action.on, stage);
    const QJsonObject outcome = outcomeOver(outcomeOver(outcomeOf(stage, fault), fault.expect), differs);
    row.expect = expectationOf(row, stage, fault, outcome);
    m_tables.m_rows.append(row);
}

// The moments of a stage in the words of its journal.
QString TablesReader::filledIn(QString moment, const TableStage &stage) const
{
    moment.replace(QLatin1String("@before"), stage.before);
    for (const Call &call : m_tables.journey(stage.journey).calls) {
        if (call.name == stage.call)
            moment.replace(QLatin1String("@call"), call.line);
    }
    return moment;
}

Expectation TablesReader::expectationOf(const Row &row, const TableStage &stage, const TableFault &fault,
                                        const QJsonObject &outcome) const
{
    const JourneyPlan plan = m_tables.journey(stage.journey);
    const bool goesOn = outcome.value(QLatin1String("goes_on")).toBool();
    StrictObject object(outcomeOver(goesOn ? plan.end : stage.stop, outcome), row.id());
    object.flag("goes_on");
    Expectation expect;
    expect.page = requiredText(object, "page");
    expect.boxes = boxesIn(object, "message", "messages");
    expect.boxes.replaceInStrings(QStringLiteral("@msg"), wordsOf(stage.place, fault.does));
    expect.ending = endingOf(object.choice("ends", kEndings).value_or(QString()));
    expect.mayClose = object.choice("close", list("possible refused")) != QLatin1String("refused");
    expect.files = requiredText(object, "files");
    expect.log = object.texts("log").value_or(QStringList());
    expect.journal = object.texts("journal").value_or(QStringList());
    expect.world = object.object("world").value_or(QJsonObject());
    const bool isSeen = object.flag("seen").value_or(fault.isSeen);
    expect.asked = askedBy(stage, isSeen, goesOn);
    expect.asked.unheard = isSeen && fault.isSeen ? 0 : 1;
    object.inside("asked", [&](StrictObject &asked) {
        for (auto call = expect.asked.times.begin(); call != expect.asked.times.end(); ++call)
            *call = asked.number(call.key().toLatin1().constData(), 0, kMostAsked).value_or(*call);
    });

    expect.next.how = expect.mayClose ? NextAttempt::How::Start : NextAttempt::How::Press;
    if (goesOn)
        expect.next.how = NextAttempt::How::None;
    expect.next.journey = stage.journey;
    readNext(object, expect.next);
    object.refuseOthers();
    for (const QString &state : {expect.files, expect.next.files}) {
        if (!m_tables.m_files.contains(state))
            object.refuse(QStringLiteral("files"),
                          QStringLiteral("names the unknown state \"%1\"").arg(state));
    }
    return expect;
}

// What is not said stays as it is, or is as at the end of the journey.
void TablesReader::readNext(StrictObject &object, NextAttempt &next) const
{
    if (const auto how = object.choice("next", list("none press start kill")))
        next.how = howOf(*how);
    next.journey = object.choice("next_journey", list("join leave")).value_or(next.journey);
    const QJsonObject end = m_tables.journey(next.journey).end;
    next.page = object.text("next_page").value_or(end.value(QLatin1String("page")).toString());
    next.boxes = boxesIn(object, "next_message", "next_messages");
    if (!next.boxes.isEmpty() && !m_tables.journey(next.journey).stops.contains(next.boxes.last()))
        object.refuse(QStringLiteral("next_message"), QStringLiteral("is none of the journey's stops"));
    next.files = object.text("next_files").value_or(end.value(QLatin1String("files")).toString());
}

// Up to the stage each call is made once, after it none, unless the journey goes on.
ExpectedCalls TablesReader::askedBy(const TableStage &stage, bool isSeen, bool goesOn) const
{
    ExpectedCalls asked;
    bool isOver = false;
    bool isKnown = false;
    for (const Call &call : m_tables.journey(stage.journey).calls) {
        const bool isStage = call.name == stage.call;
        isKnown = isKnown || isStage;
        const bool isMade = !isOver && (!call.isOptional || stage.with.contains(call.name));
        asked.times.insert(call.name, isMade && (isSeen || !isStage) ? 1 : 0);
        isOver = isOver || (isStage && !goesOn);
    }
    if (!isKnown)
        throw JsonTrouble{
            QStringLiteral("stage \"%1\": the journey has no call \"%2\"").arg(stage.name, stage.call)};
    return asked;
}

} // namespace sandbox
