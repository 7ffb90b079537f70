// SPDX-License-Identifier: Apache-2.0
#include "campaign/tableparts.h"

#include "campaign/overlay.h"
#include "campaign/rowactions.h"
#include "scenario/strictobject.h"

namespace sandbox {

namespace {

constexpr int kMostConnections = 100;
constexpr int kMostLikes = 10; // classes that are like each other have no end

// "Like" another class: the outcome has this one key.
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

QVector<Action> readActions(StrictObject &object)
{
    QVector<Action> actions;
    object.forEach("actions", [&](StrictObject &inner) {
        Action action;
        action.on = inner.text("on").value_or(QString());
        action.what = inner.choice("do", RowActions::names()).value_or(QString());
        if (action.what.isEmpty())
            inner.refuse(QStringLiteral("do"), QStringLiteral("is missing"));
        actions.append(action);
    });
    return actions;
}

} // namespace

TableStage readStage(StrictObject &object)
{
    TableStage stage;
    stage.name = requiredText(object, "name");
    stage.journey = object.choice("journey", {QStringLiteral("join"), QStringLiteral("leave")})
                        .value_or(QStringLiteral("join"));
    stage.call = requiredText(object, "call");
    stage.with = object.texts("with").value_or(QStringList());
    stage.before = object.text("before").value_or(QString());
    stage.place.endpoint = object.text("endpoint").value_or(QString());
    stage.place.connection = object.number("connection", 1, kMostConnections).value_or(0);
    stage.place.service = object.text("service").value_or(QString());
    stage.place.operation = object.text("operation").value_or(QString());
    stage.place.granted = object.object("granted").value_or(QJsonObject());
    stage.scenario = object.object("scenario").value_or(QJsonObject());
    stage.prepare = object.object("prepare").value_or(QJsonObject());
    stage.start = object.object("start").value_or(QJsonObject());
    stage.needs = object.texts("needs").value_or(QStringList());
    stage.actions = readActions(object);
    stage.stop = object.object("stop").value_or(QJsonObject());
    stage.outcomes = objectsIn(object, "outcomes");
    object.refuseOthers();
    return stage;
}

TableFault readFault(StrictObject &object)
{
    TableFault fault;
    fault.name = requiredText(object, "name");
    fault.title = requiredText(object, "title");
    fault.classOfOutcome = requiredText(object, "class");
    fault.does = object.object("does").value_or(QJsonObject());
    fault.prepare = object.object("prepare").value_or(QJsonObject());
    fault.start = object.object("start").value_or(QJsonObject());
    fault.needs = object.texts("needs").value_or(QStringList());
    fault.actions = readActions(object);
    fault.expect = object.object("expect").value_or(QJsonObject());
    fault.isSeen = object.flag("seen").value_or(true);
    fault.only = object.texts("only").value_or(QStringList());
    fault.fast = object.texts("fast").value_or(QStringList());
    object.refuseOthers();
    return fault;
}

QJsonObject outcomeOf(const TableStage &stage, const TableFault &fault)
{
    QString name = fault.classOfOutcome;
    for (int step = 0; step < kMostLikes && !name.isEmpty(); ++step) {
        const bool isThere = stage.outcomes.contains(name);
        QJsonObject outcome = stage.outcomes.value(name);
        if (isThere && likeOf(outcome).isEmpty())
            return outcome;
        name = isThere ? likeOf(outcome) : widerClass(name);
    }
    throw JsonTrouble{QStringLiteral("stage \"%1\" has no outcome for the class \"%2\" of the fault \"%3\"")
                          .arg(stage.name, fault.classOfOutcome, fault.name)};
}

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

QString requiredText(StrictObject &object, const char *key)
{
    const auto text = object.text(key);
    if (!text)
        object.refuse(QLatin1String(key), QStringLiteral("is missing"));
    return *text;
}

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

} // namespace sandbox
