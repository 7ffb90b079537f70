// SPDX-License-Identifier: Apache-2.0
#include "scenario/scenario.h"

#include "scenario/json.h"
#include "scenario/schemacheck.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QRegularExpression>

namespace sandbox {

namespace {

// The schema has seen to names, types and ranges.

// What the word at `key` stands for; None where none is there.
template <typename Enum>
Enum choice(const QJsonObject &object, const char *key)
{
    const auto words = QMetaEnum::fromType<Enum>();
    int index = 0;
    while (index < words.keyCount() && wordOf(words.key(index)) != json::text(object, key))
        ++index;
    return index < words.keyCount() ? static_cast<Enum>(words.value(index)) : Enum::None;
}

std::optional<int> optionalNumber(const QJsonObject &object, const char *key)
{
    const QJsonValue value = object.value(QLatin1String(key));
    return value.isDouble() ? std::optional(value.toInt()) : std::nullopt;
}

std::optional<QString> optionalText(const QJsonObject &object, const char *key)
{
    const QJsonValue value = object.value(QLatin1String(key));
    return value.isString() ? std::optional(value.toString()) : std::nullopt;
}

template <typename Script>
QMap<QString, Script> scripts(const QJsonObject &object, Script (*read)(const QJsonObject &))
{
    QMap<QString, Script> result;
    for (auto each = object.begin(); each != object.end(); ++each)
        result.insert(each.key(), read(each.value().toObject()));
    return result;
}

EndpointScript endpointScript(const QJsonObject &object)
{
    EndpointScript script;
    script.status = optionalNumber(object, "status");
    if (const auto body = optionalText(object, "body"))
        script.body = body->toUtf8();
    if (const auto hex = optionalText(object, "body_hex"))
        script.body = QByteArray::fromHex(hex->toLatin1());
    script.bodyIsJson = object.contains(QLatin1String("json"));
    if (script.bodyIsJson)
        script.body = QJsonDocument(json::object(object, "json")).toJson(QJsonDocument::Compact);
    script.location = json::text(object, "location");
    script.delayMs = json::number(object, "delay_ms", 0);
    script.isHeld = json::flag(object, "hold");
    script.fault = choice<Fault>(object, "fault");
    script.times = json::number(object, "times", -1);
    return script;
}

ServiceScript serviceScript(const QJsonObject &object)
{
    ServiceScript script;
    script.present = json::flag(object, "present", true);
    script.isDenied = json::flag(object, "denied");
    script.activationFails = json::flag(object, "activation_fails");
    script.introspect = json::flag(object, "introspect", true);
    script.reply = optionalText(object, "reply");
    script.result = optionalNumber(object, "result");
    script.error = optionalText(object, "error");
    script.answer = choice<OddAnswer>(object, "answer");
    script.delayMs = json::number(object, "delay_ms", 0);
    script.isHeld = json::flag(object, "hold");
    script.spared = json::number(object, "spared", 0);
    script.vanish = json::flag(object, "vanish");
    script.ends = json::flag(object, "ends");
    script.restarts = json::flag(object, "restarts");
    script.operations = scripts(json::object(object, "operations"), serviceScript);
    return script;
}

CommandScript commandScript(const QJsonObject &object)
{
    CommandScript script;
    script.exitCode = optionalNumber(object, "exit");
    script.output = optionalText(object, "output");
    script.delayMs = json::number(object, "delay_ms", 0);
    script.isHeld = json::flag(object, "hold");
    return script;
}

ConnectionScript connectionScript(const QJsonObject &object)
{
    ConnectionScript script;
    script.from = json::number(object, "from", script.from);
    script.fault = choice<ConnectionFault>(object, "fault");
    return script;
}

// A file that is there and empty is told from an absent one by a string that is empty, but not null.
QString contentsOf(const QJsonValue &value)
{
    const QString contents = value.toString();
    return contents.isEmpty() && value.isString() ? QStringLiteral("") : contents;
}

ScenarioInput inputIn(const QJsonObject &object)
{
    ScenarioInput input;
    const auto take = [&object](const char *key, QString &target) {
        target = optionalText(object, key).value_or(target);
    };
    take("host", input.host);
    take("port", input.port);
    take("user", input.user);
    take("password", input.password);
    take("alias", input.alias);
    take("administrator", input.administrator);
    take("administrator_password", input.administratorPassword);
    input.authorise = json::flag(object, "authorise", input.authorise);
    return input;
}

} // namespace

// "CloseBeforeReply" as "close-before-reply".
QString wordOf(const char *key)
{
    static const QRegularExpression capital(QStringLiteral("(?<!^)([A-Z])"));
    return QString::fromLatin1(key).replace(capital, QStringLiteral("-\\1")).toLower();
}

ServiceScript ServiceScript::operation(const QString &name) const
{
    return operations.value(name, *this);
}

std::optional<Scenario> Scenario::load(const QString &path, QString *error)
{
    const auto json = schemacheck::read(path, QStringLiteral("scenario"), error);
    if (!json)
        return std::nullopt;
    Scenario scenario;
    scenario.m_name = QFileInfo(path).completeBaseName();
    scenario.read(*json);
    return scenario;
}

void Scenario::read(const QJsonObject &json)
{
    m_json = json;
    m_title = json::text(json, "title");
    m_journey = json::text(json, "journey") == QLatin1String("leave") ? Journey::Leave : Journey::Join;
    readServer(json::object(json, "server"));
    m_services = scripts(json::object(json, "services"), serviceScript);
    m_commands = scripts(json::object(json, "commands"), commandScript);
    readTerminal();
    m_input = inputIn(json::object(json, "input"));
    readExpectation();
}

void Scenario::readServer(const QJsonObject &server)
{
    m_serverListens = json::flag(server, "listen", true);
    m_serverSpeaksTls = json::flag(server, "tls", true);
    m_serverConfig = json::object(server, "config");
    m_connections = connectionScript(json::object(server, "connections"));
    m_endpoints = scripts(json::object(server, "endpoints"), endpointScript);
}

void Scenario::readTerminal()
{
    for (const char *bus : {"session", "system"}) {
        if (!json::flag(json::object(m_json, "buses"), bus, true))
            m_missingBuses.append(QLatin1String(bus));
    }
    m_schemaWithout = json::texts(json::object(m_json, "schema"), "without");
    const QJsonObject files = json::object(m_json, "files");
    for (auto file = files.begin(); file != files.end(); ++file)
        m_files.insert(file.key(), contentsOf(file.value()));
}

void Scenario::readExpectation()
{
    const QJsonObject expect = json::object(m_json, "expect");
    m_expectation.page = optionalText(expect, "page").value_or(m_expectation.page);
    m_expectation.boxes = json::texts(expect, "messages");
    const auto message = optionalText(expect, "message");
    for (int count = 0; message && count < json::number(expect, "times", 1); ++count)
        m_expectation.boxes += *message;
}

QString Scenario::pathOf(const QString &nameOrPath)
{
    if (nameOrPath.endsWith(QLatin1String(".json")))
        return QFileInfo(nameOrPath).absoluteFilePath();
    return names().contains(nameOrPath)
               ? QDir(standardFolder()).filePath(nameOrPath + QStringLiteral(".json"))
               : QString();
}

QString Scenario::standardFolder()
{
    return QDir::cleanPath(QCoreApplication::applicationDirPath() +
                           QLatin1String("/../share/vesk-sandbox/scenarios"));
}

QStringList Scenario::names()
{
    QStringList names;
    const QStringList files =
        QDir(standardFolder())
            .entryList({QStringLiteral("*.json")}, QDir::Files | QDir::Readable, QDir::Name);
    for (const QString &file : files)
        names += QFileInfo(file).completeBaseName();
    return names;
}

} // namespace sandbox
