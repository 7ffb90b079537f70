// SPDX-License-Identifier: Apache-2.0
#include "campaign/rows/faultscenario.h"

#include "scenario/json.h"

#include <QJsonArray>

#include <algorithm>

namespace sandbox {

namespace {

// The reply as an object, before it is written down.
QJsonObject replyObject(const QJsonObject &stage, const QJsonObject &reply)
{
    QJsonObject object = json::object(reply.contains(QLatin1String("json")) ? reply : stage,
                                      reply.contains(QLatin1String("json")) ? "json" : "granted");
    const QJsonObject changes = json::object(reply, "set");
    for (auto change = changes.begin(); change != changes.end(); ++change)
        json::setAt(object, change.key(), change.value());
    for (const QString &path : json::texts(reply, "drop"))
        json::setAt(object, path, QJsonValue::Undefined);
    return object;
}

QString repeated(const QJsonObject &repeat)
{
    const int times = repeat.value(QLatin1String("times")).toInt(1);
    return json::text(repeat, "text").repeated(times) + json::text(repeat, "middle") +
           json::text(repeat, "end").repeated(times);
}

QJsonObject endpointFor(const QJsonObject &stage, const QJsonObject &reply)
{
    QJsonObject endpoint{{QStringLiteral("status"), reply.value(QLatin1String("status")).toInt(200)}};
    if (reply.contains(QLatin1String("location")))
        endpoint.insert(QStringLiteral("location"), reply.value(QLatin1String("location")));
    if (reply.contains(QLatin1String("body")))
        endpoint.insert(QStringLiteral("body"), reply.value(QLatin1String("body")));
    else if (reply.contains(QLatin1String("hex")))
        endpoint.insert(QStringLiteral("body_hex"), reply.value(QLatin1String("hex")));
    else if (reply.contains(QLatin1String("repeat")))
        endpoint.insert(QStringLiteral("body"), repeated(json::object(reply, "repeat")));
    else
        endpoint.insert(QStringLiteral("json"), replyObject(stage, reply));
    return endpoint;
}

QJsonObject serverPart(const QString &key, const QJsonValue &value)
{
    return {{QStringLiteral("server"), QJsonObject{{key, value}}}};
}

QJsonObject endpointPart(const QJsonObject &stage, const QJsonObject &endpoint)
{
    return serverPart(QStringLiteral("endpoints"), QJsonObject{{json::text(stage, "endpoint"), endpoint}});
}

QJsonObject servicePart(const QJsonObject &stage, const QJsonObject &keys)
{
    const QString operation = json::text(stage, "operation");
    const bool isWhole = keys.contains(QLatin1String("present")) || keys.contains(QLatin1String("denied")) ||
                         keys.contains(QLatin1String("activation_fails"));
    QJsonObject service = keys;
    if (!operation.isEmpty() && !isWhole)
        service = {{QStringLiteral("operations"), QJsonObject{{operation, keys}}}};
    return {{QStringLiteral("services"), QJsonObject{{json::text(stage, "service"), service}}}};
}

} // namespace

QJsonObject faultScenario(const QJsonObject &stage, const QJsonObject &does)
{
    QJsonObject scenario = json::object(does, "world");
    if (does.contains(QLatin1String("reply")))
        scenario =
            json::overlaid(scenario, endpointPart(stage, endpointFor(stage, json::object(does, "reply"))));
    if (does.contains(QLatin1String("endpoint")))
        scenario = json::overlaid(scenario, endpointPart(stage, json::object(does, "endpoint")));
    if (does.contains(QLatin1String("connection")))
        scenario = json::overlaid(
            scenario,
            serverPart(QStringLiteral("connections"),
                       QJsonObject{{QStringLiteral("from"), stage.value(QLatin1String("connection"))},
                                   {QStringLiteral("fault"), does.value(QLatin1String("connection"))}}));
    if (does.contains(QLatin1String("service")))
        scenario = json::overlaid(scenario, servicePart(stage, json::object(does, "service")));
    return scenario;
}

QString wordsOf(const QJsonObject &stage, const QJsonObject &does)
{
    const QJsonObject reply = json::object(does, "reply");
    if (reply.contains(QLatin1String("words")))
        return json::text(reply, "words");
    return json::text(replyObject(stage, reply), "msg");
}

} // namespace sandbox
