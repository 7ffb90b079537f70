// SPDX-License-Identifier: Apache-2.0
#include "campaign/tablesreader.h"

#include "campaign/faultscenario.h"
#include "campaign/overlay.h"
#include "campaign/rowactions.h"
#include "scenario/strictobject.h"

namespace sandbox {

namespace {

constexpr int kMostAsked = 100;
constexpr int kLongestWaitMs = 60000;

QStringList list(const char *words)
{
    return QString::fromLatin1(words).split(QLatin1Char(' '));
}

QString required(StrictObject &object, const char *key)
{
    const auto text = object.text(key);
    if (!text)
        object.refuse(QLatin1String(key), QStringLiteral("is missing"));
    return *text;
}

// What stands at `key`, one object for each of its keys.
QMap<QString, QJsonObject> objectsIn(StrictObject &top, const char *key)
{
    QMap<QString, QJsonObject> result;
    const QJsonObject object = top.object(key).value_or(QJsonObject());
    for (auto entry = object.begin(); entry != object.end(); ++entry) {
        if (!entry.value().isObject())
            top.refuse(QLatin1String(key) + QLatin1Char('.') + entry.key(),
                       QStringLiteral("is not an object"));
        result.insert(entry.key(), entry.value().toObject());
    }
    return result;
}

// "Like" another class: the outcome has one key, "like".
QString likeOf(const QJsonObject &outcome)
{
    return outcome.value(QLatin1String("like")).toString();
}

// A class without an outcome of its own comes out like a wider one.
QString widerClass(const QString &name)
{
    static const QMap<QString, QString> wider = {
        {QStringLiteral("empty"), QStringLiteral("no-json")},
        {QStringLiteral("empty-error"), QStringLiteral("no-json-error")},
        {QStringLiteral("no-json-error"), QStringLiteral("no-json")},
        {QStringLiteral("error-400"), QStringLiteral("error")},
        {QStringLiteral("error"), QStringLiteral("refusal")},
        {QStringLiteral("own"), QStringLiteral("granted")},
        {QStringLiteral("limit"), QStringLiteral("refusal")},
        {QStringLiteral("code-missing"), QStringLiteral("granted")},
        {QStringLiteral("no-data"), QStringLiteral("no-code")},
        {QStringLiteral("lost-reply"), QStringLiteral("no-reply")},
        {QStringLiteral("unsafe"), QStringLiteral("no-reply")},
    };
    return wider.value(name);
}

// A word about the boxes takes the place of one of the other form.
QJsonObject outcomeOver(QJsonObject base, const QJsonObject &patch)
{
    for (const char *prefix : {"", "next_"}) {
        const QString one = QLatin1String(prefix) + QStringLiteral("message");
        const QString many = QLatin1String(prefix) + QStringLiteral("messages");
        if (patch.contains(one) || patch.contains(many)) {
            base.remove(one);
            base.remove(many);
        }
    }
    return overlaid(base, patch);
}

NextAttempt::How howOf(const QString &word)
{
    return static_cast<NextAttempt::How>(list("none press start kill").indexOf(word));
}

QVector<Action> readActions(StrictObject &object)
{
    QVector<Action> actions;
    object.forEach("actions", [&](StrictObject &inner) {
        Action action;
        action.on = inner.text("on").value_or(QString());
        action.afterMs = inner.number("after_ms", 0, kLongestWaitMs).value_or(0);
        action.what = inner.choice("do", RowActions::names()).value_or(QString());
        if (action.what.isEmpty())
            inner.refuse(QStringLiteral("do"), QStringLiteral("is missing"));
        actions.append(action);
    });
    return actions;
}

QStringList boxesIn(StrictObject &object, const char *one, const char *many)
{
    const auto text = object.text(one);
    const auto texts = object.texts(many);
    if (text && texts)
        object.refuse(QLatin1String(one), QStringLiteral("stands beside \"%1\"").arg(QLatin1String(many)));
    return text ? QStringList{*text} : texts.value_or(QStringList());
}

} // namespace

struct TablesReader::Stage
{
    QString name;
    QString journey;
    QString call;
    QStringList with; // optional calls that the journey makes here
    QString before;   // part of the journal's line after which the stage's call comes next
    FaultPlace place;
    QJsonObject scenario;
    QJsonObject prepare;
    QVector<Action> actions;
    QJsonObject stop;
    QMap<QString, QJsonObject> outcomes;
};

struct TablesReader::Fault
{
    QString name;
    QString title;
    QString classOfOutcome;
    QJsonObject does;
    QJsonObject prepare;
    QVector<Action> actions;
    QJsonObject expect;
    bool isSeen = true; // the service hears of the call
    QStringList only;   // stages; empty: all
    QStringList fast;   // stages whose rows are in the fast part
};

void TablesReader::readJourneys(StrictObject &top, CampaignTables &tables)
{
    top.forEachKey(list("join leave"), [&](const QString &name, StrictObject &object) {
        JourneyPlan plan;
        plan.pages = object.texts("pages").value_or(QStringList());
        plan.end = object.object("end").value_or(QJsonObject());
        object.forEach("calls", [&](StrictObject &inner) {
            plan.calls.append({required(inner, "name"), required(inner, "page"), required(inner, "line"),
                               inner.flag("optional").value_or(false)});
        });
        tables.m_journeys.insert(name, plan);
    });
}

void TablesReader::readFiles(StrictObject &top, CampaignTables &tables)
{
    const auto states = objectsIn(top, "states");
    for (auto state = states.begin(); state != states.end(); ++state) {
        QMap<QString, QString> files;
        for (auto file = state->begin(); file != state->end(); ++file) {
            if (!file.value().isString() || !file.value().toString().contains(QLatin1Char(' ')))
                top.refuse(QStringLiteral("states.%1.%2").arg(state.key(), file.key()),
                           QStringLiteral("is not a mode and a content"));
            files.insert(file.key(), file.value().toString());
        }
        tables.m_files.insert(state.key(), files);
    }
    top.refuseOthers();
}

void TablesReader::read(StrictObject &top)
{
    QVector<Stage> stages;
    top.forEach("stages",
                [&](StrictObject &object) { stages.append(readStage(required(object, "name"), object)); });
    QVector<Fault> faults;
    top.forEach("faults",
                [&](StrictObject &object) { faults.append(readFault(required(object, "name"), object)); });
    QMap<QString, QJsonObject> exceptions = objectsIn(top, "exceptions");
    top.refuseOthers();
    for (const Stage &stage : stages) {
        for (const Fault &fault : faults) {
            if (fault.only.isEmpty() || fault.only.contains(stage.name))
                addRow(stage, fault, exceptions.take(stage.name + QLatin1Char('/') + fault.name));
        }
    }
    if (!exceptions.isEmpty())
        top.refuse(QStringLiteral("exceptions.") + exceptions.firstKey(),
                   QStringLiteral("belongs to no row"));
}

TablesReader::Stage TablesReader::readStage(const QString &name, StrictObject &object)
{
    Stage stage;
    stage.name = name;
    stage.journey = object.choice("journey", list("join leave")).value_or(QStringLiteral("join"));
    stage.call = required(object, "call");
    stage.with = object.texts("with").value_or(QStringList());
    stage.before = object.text("before").value_or(QString());
    stage.place.endpoint = object.text("endpoint").value_or(QString());
    stage.place.connection = object.number("connection", 1, kMostAsked).value_or(0);
    stage.place.service = object.text("service").value_or(QString());
    stage.place.operation = object.text("operation").value_or(QString());
    stage.place.granted = object.object("granted").value_or(QJsonObject());
    stage.scenario = object.object("scenario").value_or(QJsonObject());
    stage.prepare = object.object("prepare").value_or(QJsonObject());
    stage.actions = readActions(object);
    stage.stop = object.object("stop").value_or(QJsonObject());
    stage.outcomes = objectsIn(object, "outcomes");
    object.refuseOthers();
    return stage;
}

TablesReader::Fault TablesReader::readFault(const QString &name, StrictObject &object)
{
    Fault fault;
    fault.name = name;
    fault.title = required(object, "title");
    fault.classOfOutcome = required(object, "class");
    fault.does = object.object("does").value_or(QJsonObject());
    fault.prepare = object.object("prepare").value_or(QJsonObject());
    fault.actions = readActions(object);
    fault.expect = object.object("expect").value_or(QJsonObject());
    fault.isSeen = object.flag("seen").value_or(true);
    fault.only = object.texts("only").value_or(QStringList());
    fault.fast = object.texts("fast").value_or(QStringList());
    object.refuseOthers();
    return fault;
}

// An exception may say "skip": true, and must say why in "note".
void TablesReader::addRow(const Stage &stage, const Fault &fault, const QJsonObject &exception)
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
    row.scenario = overlaid(stage.scenario, faultScenario(stage.place, fault.does, row.id()));
    row.prepare = overlaid(stage.prepare, fault.prepare);
    row.actions = stage.actions + fault.actions;
    for (Action &action : row.actions) {
        action.on.replace(QLatin1String("@before"), stage.before);
        for (const Call &call : m_tables.journey(stage.journey).calls) {
            if (call.name == stage.call)
                action.on.replace(QLatin1String("@call"), call.line);
        }
    }
    const QJsonObject outcome = outcomeOver(outcomeOver(outcomeOf(stage, fault), fault.expect), differs);
    row.expect = expectationOf(row, stage, fault, outcome);
    m_tables.m_rows.append(row);
}

QJsonObject TablesReader::outcomeOf(const Stage &stage, const Fault &fault) const
{
    QString name = fault.classOfOutcome;
    while (!name.isEmpty()) {
        if (!stage.outcomes.contains(name)) {
            name = widerClass(name);
            continue;
        }
        const QJsonObject outcome = stage.outcomes.value(name);
        if (likeOf(outcome).isEmpty())
            return outcome;
        name = likeOf(outcome);
    }
    throw JsonTrouble{QStringLiteral("stage \"%1\" has no outcome for the class \"%2\" of the fault \"%3\"")
                          .arg(stage.name, fault.classOfOutcome, fault.name)};
}

Expectation TablesReader::expectationOf(const Row &row, const Stage &stage, const Fault &fault,
                                        const QJsonObject &outcome) const
{
    const JourneyPlan plan = m_tables.journey(stage.journey);
    const bool goesOn = outcome.value(QLatin1String("goes_on")).toBool();
    StrictObject object(outcomeOver(goesOn ? plan.end : stage.stop, outcome), row.id());
    object.flag("goes_on");
    Expectation expect;
    expect.page = required(object, "page");
    expect.boxes = boxesIn(object, "message", "messages");
    expect.boxes.replaceInStrings(QStringLiteral("@msg"), wordsOf(stage.place, fault.does));
    expect.mayClose = object.choice("close", list("possible refused")) != QLatin1String("refused");
    expect.files = required(object, "files");
    expect.log = object.texts("log").value_or(QStringList());
    expect.asked = askedBy(stage, object.flag("seen").value_or(fault.isSeen), goesOn);
    object.inside("asked", [&](StrictObject &asked) {
        for (auto call = expect.asked.begin(); call != expect.asked.end(); ++call)
            *call = asked.number(call.key().toLatin1().constData(), 0, kMostAsked).value_or(*call);
    });

    NextAttempt &next = expect.next;
    next.how = expect.mayClose ? NextAttempt::How::Start : NextAttempt::How::Press;
    if (goesOn)
        next.how = NextAttempt::How::None;
    if (const auto how = object.choice("next", list("none press start kill")))
        next.how = howOf(*how);
    next.journey = object.choice("next_journey", list("join leave")).value_or(stage.journey);
    next.page = object.text("next_page")
                    .value_or(m_tables.journey(next.journey).end.value(QLatin1String("page")).toString());
    next.boxes = boxesIn(object, "next_message", "next_messages");
    next.files = object.text("next_files")
                     .value_or(m_tables.journey(next.journey).end.value(QLatin1String("files")).toString());
    object.refuseOthers();
    for (const QString &state : {expect.files, next.files}) {
        if (!m_tables.m_files.contains(state))
            object.refuse(QStringLiteral("files"),
                          QStringLiteral("names the unknown state \"%1\"").arg(state));
    }
    return expect;
}

// Up to the stage each call is made once, after it none, unless the journey goes on.
QMap<QString, int> TablesReader::askedBy(const Stage &stage, bool isSeen, bool goesOn) const
{
    QMap<QString, int> asked;
    bool isOver = false;
    bool isKnown = false;
    for (const Call &call : m_tables.journey(stage.journey).calls) {
        const bool isStage = call.name == stage.call;
        isKnown = isKnown || isStage;
        const bool isMade = !isOver && (!call.isOptional || stage.with.contains(call.name));
        asked.insert(call.name, isMade && (isSeen || !isStage) ? 1 : 0);
        isOver = isOver || (isStage && !goesOn);
    }
    if (!isKnown)
        throw JsonTrouble{
            QStringLiteral("stage \"%1\": the journey has no call \"%2\"").arg(stage.name, stage.call)};
    return asked;
}

} // namespace sandbox
