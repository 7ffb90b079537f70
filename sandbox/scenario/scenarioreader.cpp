// SPDX-License-Identifier: Apache-2.0
#include "scenario/scenarioreader.h"

#include "scenario/strictobject.h"

#include <QJsonDocument>

#include <limits>

namespace sandbox {

namespace {

constexpr int kLongestDelayMs = 600000;
constexpr int kMostRepeats = 1000000;

QStringList list(const char *words)
{
    return QString::fromLatin1(words).split(QLatin1Char(' '));
}

Fault faultOf(StrictObject &script)
{
    const QStringList names = list("close-before-reply reset half-header truncate drip garbage flood");
    const auto name = script.choice("fault", names);
    return name ? static_cast<Fault>(names.indexOf(*name) + 1) : Fault::None;
}

int delayOf(StrictObject &script)
{
    return script.number("delay_ms", 0, kLongestDelayMs).value_or(0);
}

void readBody(EndpointScript &script, StrictObject &object)
{
    if (const auto text = object.text("body"))
        script.body = text->toUtf8();
    if (const auto hex = object.text("body_hex")) {
        if (script.body)
            object.refuse(QStringLiteral("body_hex"),
                          QStringLiteral("stands beside \"body\": give one of them"));
        script.body = QByteArray::fromHex(hex->toLatin1());
    }
    const auto json = object.object("json");
    if (!json)
        return;
    if (script.body)
        object.refuse(QStringLiteral("json"), QStringLiteral("stands beside \"body\": give one of them"));
    script.body = QJsonDocument(*json).toJson(QJsonDocument::Compact);
    script.bodyIsJson = true;
}

EndpointScript readEndpoint(StrictObject &object)
{
    EndpointScript script;
    script.status = object.number("status", 100, 599);
    readBody(script, object);
    script.location = object.text("location").value_or(QString());
    script.delayMs = delayOf(object);
    script.isHeld = object.flag("hold").value_or(false);
    script.fault = faultOf(object);
    script.times = object.number("times", 1, kMostRepeats).value_or(-1);
    return script;
}

ServiceScript readOperation(StrictObject &object)
{
    ServiceScript script;
    script.reply = object.text("reply");
    script.result = object.number("result", std::numeric_limits<int>::min(), std::numeric_limits<int>::max());
    script.error = object.text("error");
    script.delayMs = delayOf(object);
    script.isHeld = object.flag("hold").value_or(false);
    script.spared = object.number("spared", 0, kMostRepeats).value_or(0);
    script.vanish = object.flag("vanish").value_or(false);
    script.ends = object.flag("ends").value_or(false);
    script.restarts = object.flag("restarts").value_or(false);
    const QStringList answers = list("wrong-type nothing");
    if (const auto answer = object.choice("answer", answers))
        script.answer = static_cast<OddAnswer>(answers.indexOf(*answer) + 1);
    return script;
}

ServiceScript readService(const QString &name, StrictObject &object)
{
    ServiceScript script = readOperation(object);
    script.present = object.flag("present").value_or(true);
    script.isDenied = object.flag("denied").value_or(false);
    script.activationFails = object.flag("activation_fails").value_or(false);
    if (name == QLatin1String("iam"))
        script.introspect = object.flag("introspect").value_or(true);
    if (name == QLatin1String("veskg")) {
        object.inside("operations", [&](StrictObject &operations) {
            operations.forEachKey(list("join copyConfig remove"),
                                  [&](const QString &operation, StrictObject &inner) {
                                      script.operations.insert(operation, readOperation(inner));
                                  });
        });
    }
    return script;
}

CommandScript readCommand(StrictObject &object)
{
    CommandScript script;
    script.exitCode = object.number("exit", 0, 255);
    script.output = object.text("output");
    script.delayMs = delayOf(object);
    script.isHeld = object.flag("hold").value_or(false);
    return script;
}

// A file that is there and empty is told from an absent one by a string that is empty, but not null.
QString contentsOf(const QJsonValue &value)
{
    if (value.isNull())
        return {};
    const QString contents = value.toString();
    return contents.isEmpty() ? QStringLiteral("") : contents;
}

ConnectionScript readConnections(StrictObject &object)
{
    const QStringList names =
        list("refused mute plain handshake-closed handshake-reset handshake-garbage old-tls no-common-cipher "
             "expired not-yet-valid other-host other-ca other-ca-of-that-name self-signed client-purpose "
             "closed-before-request reset-before-request closed-during-request");
    ConnectionScript script;
    script.from = object.number("from", 1, kMostRepeats).value_or(script.from);
    if (const auto name = object.choice("fault", names))
        script.fault = static_cast<ConnectionFault>(names.indexOf(*name) + 1);
    return script;
}

void takeText(StrictObject &object, const char *key, QString &target)
{
    target = object.text(key).value_or(target);
}

} // namespace

Scenario ScenarioReader::read(const QString &name, const QByteArray &text)
{
    StrictObject top = StrictObject::parse(text);
    Scenario scenario;
    scenario.m_name = name;
    scenario.m_title = top.text("title").value_or(QString());
    if (scenario.m_title.isEmpty())
        top.refuse(QStringLiteral("title"), QStringLiteral("is missing"));
    if (top.choice("journey", list("join leave")) == QLatin1String("leave"))
        scenario.m_journey = Journey::Leave;
    top.inside("server", [&](StrictObject &server) { readServer(scenario, server); });
    top.inside("services", [&](StrictObject &services) {
        services.forEachKey(list("network veskg iam login"),
                            [&](const QString &service, StrictObject &inner) {
                                scenario.m_services.insert(service, readService(service, inner));
                            });
    });
    top.inside("commands", [&](StrictObject &commands) {
        commands.forEachKey(list("gsettings systemctl killall id"),
                            [&](const QString &command, StrictObject &inner) {
                                scenario.m_commands.insert(command, readCommand(inner));
                            });
    });
    top.inside("buses", [&](StrictObject &buses) {
        for (const char *bus : {"session", "system"}) {
            if (!buses.flag(bus).value_or(true))
                scenario.m_missingBuses.append(QLatin1String(bus));
        }
    });
    top.inside("schema", [&](StrictObject &schema) {
        scenario.m_schemaWithout = schema.texts("without").value_or(QStringList());
    });
    readFiles(scenario, top);
    top.inside("input", [&](StrictObject &input) { scenario.m_input = readInput(input); });
    top.inside("expect", [&](StrictObject &expect) { scenario.m_expectation = readExpectation(expect); });
    top.refuseOthers();
    return scenario;
}

void ScenarioReader::readServer(Scenario &scenario, StrictObject &server)
{
    scenario.m_serverListens = server.flag("listen").value_or(true);
    scenario.m_serverSpeaksTls = server.flag("tls").value_or(true);
    scenario.m_serverConfig = server.object("config").value_or(QJsonObject());
    server.inside("connections",
                  [&](StrictObject &inner) { scenario.m_connections = readConnections(inner); });
    server.inside("endpoints", [&](StrictObject &endpoints) {
        endpoints.forEachKey(Scenario::endpointNames(), [&](const QString &name, StrictObject &inner) {
            scenario.m_endpoints.insert(name, readEndpoint(inner));
        });
    });
}

void ScenarioReader::readFiles(Scenario &scenario, StrictObject &top)
{
    const QJsonObject files = top.object("files").value_or(QJsonObject());
    const StrictObject inside(files, QStringLiteral("files"));
    for (auto file = files.begin(); file != files.end(); ++file) {
        if (!file.key().startsWith(QLatin1Char('/')))
            inside.refuse(file.key(), QStringLiteral("is no absolute path"));
        if (!file.value().isString() && !file.value().isNull())
            inside.refuse(file.key(), QStringLiteral("is neither a text nor null"));
        scenario.m_files.insert(file.key(), contentsOf(file.value()));
    }
}

ScenarioInput ScenarioReader::readInput(StrictObject &object)
{
    ScenarioInput input;
    takeText(object, "host", input.host);
    takeText(object, "port", input.port);
    takeText(object, "user", input.user);
    takeText(object, "password", input.password);
    takeText(object, "alias", input.alias);
    takeText(object, "administrator", input.administrator);
    takeText(object, "administrator_password", input.administratorPassword);
    input.authorise = object.flag("authorise").value_or(input.authorise);
    return input;
}

ScenarioExpectation ScenarioReader::readExpectation(StrictObject &object)
{
    const QStringList pages = list("server account alias summary progress success leave");
    ScenarioExpectation expectation;
    expectation.page = object.choice("page", pages).value_or(expectation.page);
    expectation.boxes = object.texts("messages").value_or(QStringList());
    const auto message = object.text("message");
    const auto times = object.number("times", 1, kMostRepeats);
    if (message && !expectation.boxes.isEmpty())
        object.refuse(QStringLiteral("message"),
                      QStringLiteral("stands beside \"messages\": give one of them"));
    if (times && !message)
        object.refuse(QStringLiteral("times"), QStringLiteral("has no \"message\" to repeat"));
    for (int count = 0; message && count < times.value_or(1); ++count)
        expectation.boxes += *message;
    return expectation;
}

} // namespace sandbox
