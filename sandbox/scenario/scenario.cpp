// SPDX-License-Identifier: Apache-2.0
#include "scenario/scenario.h"

#include "scenario/schemacheck.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QRegularExpression>

namespace sandbox {

// "CloseBeforeReply" as "close-before-reply".
QString wordOf(const char *key)
{
    static const QRegularExpression capital(QStringLiteral("(?<!^)([A-Z])"));
    return QString::fromLatin1(key).replace(capital, QStringLiteral("-\\1")).toLower();
}

Scenario Scenario::load(const QString &path)
{
    Scenario scenario;
    scenario.m_json = schemacheck::read(path, QStringLiteral("scenario"));
    return scenario;
}

// The schema has checked names, types and ranges of all that follows.

ConnectionScript Scenario::serverConnections() const
{
    const QJsonObject connections = json::object(json::object(m_json, "server"), "connections");
    return {json::number(connections, "from", 1), valueOf<ConnectionFault>(connections, "fault")};
}

ScenarioInput Scenario::input() const
{
    const QJsonObject object = json::object(m_json, "input");
    ScenarioInput input;
    const auto take = [&object](const char *key, QString &target) {
        target = object.value(QLatin1String(key)).toString(target);
    };
    take("host", input.host);
    take("port", input.port);
    take("user", input.user);
    take("password", input.password);
    take("alias", input.alias);
    take("administrator", input.administrator);
    take("administrator_password", input.administratorPassword);
    input.authorise = json::flag(object, "authorise", true);
    return input;
}

ScenarioExpectation Scenario::expectation() const
{
    const QJsonObject expect = json::object(m_json, "expect");
    ScenarioExpectation result;
    result.page = expect.value(QLatin1String("page")).toString(result.page);
    result.messages = json::texts(expect, "messages");
    for (int count = 0; expect.contains(QLatin1String("message")) && count < json::number(expect, "times", 1);
         ++count)
        result.messages += json::text(expect, "message");
    return result;
}

QString Scenario::pathOf(const QString &nameOrPath)
{
    if (nameOrPath.endsWith(QLatin1String(".json")))
        return QFileInfo(nameOrPath).absoluteFilePath();
    return names().contains(nameOrPath)
               ? QDir(standardDirectory()).filePath(nameOrPath + QStringLiteral(".json"))
               : QString();
}

QString Scenario::standardDirectory()
{
    return QDir::cleanPath(QCoreApplication::applicationDirPath() +
                           QLatin1String("/../share/vesk-sandbox/scenarios"));
}

QStringList Scenario::names()
{
    QStringList names;
    const QStringList files =
        QDir(standardDirectory())
            .entryList({QStringLiteral("*.json")}, QDir::Files | QDir::Readable, QDir::Name);
    for (const QString &file : files)
        names += QFileInfo(file).completeBaseName();
    return names;
}

} // namespace sandbox
