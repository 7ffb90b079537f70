// SPDX-License-Identifier: Apache-2.0
#include "campaign/faultscenario.h"

#include "campaign/overlay.h"
#include "scenario/strictobject.h"

#include <QJsonArray>

#include <algorithm>

namespace sandbox {

namespace {

constexpr int kMostRepeats = 10000000;

// The reply as an object, before it is written down.
QJsonObject replyObject(const FaultPlace &place, const QJsonObject &reply)
{
    QJsonObject object = place.granted;
    if (reply.value(QLatin1String("json")).isObject())
        object = reply.value(QLatin1String("json")).toObject();
    const QJsonObject changes = reply.value(QLatin1String("set")).toObject();
    for (auto change = changes.begin(); change != changes.end(); ++change)
        setAt(object, change.key(), change.value());
    const QJsonArray dropped = reply.value(QLatin1String("drop")).toArray();
    for (const QJsonValue &path : dropped)
        setAt(object, path.toString(), QJsonValue::Undefined);
    return object;
}

QString repeated(StrictObject &object)
{
    const QString text = object.text("text").value_or(QString());
    const int times = object.number("times", 0, kMostRepeats).value_or(1);
    return text.repeated(times) + object.text("middle").value_or(QString()) +
           object.text("end").value_or(QString()).repeated(times);
}

QJsonObject endpointFor(const FaultPlace &place, const QJsonObject &reply, StrictObject &strict)
{
    QJsonObject endpoint{{QStringLiteral("status"), strict.number("status", 100, 599).value_or(200)}};
    if (const auto location = strict.text("location"))
        endpoint.insert(QStringLiteral("location"), *location);
    strict.text("words");
    const auto body = strict.text("body");
    const auto hex = strict.text("hex");
    strict.inside("repeat",
                  [&](StrictObject &repeat) { endpoint.insert(QStringLiteral("body"), repeated(repeat)); });
    const bool isMade = strict.object("set").has_value() | strict.texts("drop").has_value() |
                        strict.object("json").has_value();
    if (body)
        endpoint.insert(QStringLiteral("body"), *body);
    else if (hex)
        endpoint.insert(QStringLiteral("body_hex"), *hex);
    else if (isMade || !endpoint.contains(QStringLiteral("body")))
        endpoint.insert(QStringLiteral("json"), replyObject(place, reply));
    return endpoint;
}

QJsonObject serverPart(const QString &key, const QJsonValue &value)
{
    return {{QStringLiteral("server"), QJsonObject{{key, value}}}};
}

QJsonObject endpointPart(const FaultPlace &place, const QJsonObject &endpoint)
{
    return serverPart(QStringLiteral("endpoints"), QJsonObject{{place.endpoint, endpoint}});
}

QJsonObject servicePart(const FaultPlace &place, const QJsonObject &keys)
{
    const QStringList ofWhole{QStringLiteral("present"), QStringLiteral("denied"),
                              QStringLiteral("activation_fails")};
    const QStringList names = keys.keys();
    const bool isWhole =
        std::any_of(names.begin(), names.end(), [&](const QString &key) { return ofWhole.contains(key); });
    QJsonObject service = keys;
    if (!place.operation.isEmpty() && !isWhole)
        service = {{QStringLiteral("operations"), QJsonObject{{place.operation, keys}}}};
    return {{QStringLiteral("services"), QJsonObject{{place.service, service}}}};
}

} // namespace

QJsonObject faultScenario(const FaultPlace &place, const QJsonObject &does, const QString &where)
{
    StrictObject strict(does, where + QStringLiteral(" does"));
    QJsonObject scenario = strict.object("world").value_or(QJsonObject());
    strict.inside("reply", [&](StrictObject &reply) {
        const QJsonObject plain = does.value(QLatin1String("reply")).toObject();
        scenario = overlaid(scenario, endpointPart(place, endpointFor(place, plain, reply)));
    });
    if (const auto endpoint = strict.object("endpoint"))
        scenario = overlaid(scenario, endpointPart(place, *endpoint));
    if (const auto connection = strict.text("connection"))
        scenario = overlaid(scenario, serverPart(QStringLiteral("connections"),
                                                 QJsonObject{{QStringLiteral("from"), place.connection},
                                                             {QStringLiteral("fault"), *connection}}));
    if (const auto service = strict.object("service"))
        scenario = overlaid(scenario, servicePart(place, *service));
    strict.refuseOthers();
    return scenario;
}

QString wordsOf(const FaultPlace &place, const QJsonObject &does)
{
    const QJsonObject reply = does.value(QLatin1String("reply")).toObject();
    if (reply.contains(QLatin1String("words")))
        return reply.value(QLatin1String("words")).toString();
    return replyObject(place, reply).value(QLatin1String("msg")).toString();
}

} // namespace sandbox
