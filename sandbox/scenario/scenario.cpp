// SPDX-License-Identifier: Apache-2.0
#include "scenario/scenario.h"

#include "scenario/scenarioreader.h"
#include "scenario/strictobject.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace sandbox {

ServiceScript ServiceScript::operation(const QString &name) const
{
    return operations.value(name, *this);
}

std::optional<Scenario> Scenario::load(const QString &path, QString *error)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        *error = QStringLiteral("%1: cannot be read: %2").arg(path, file.errorString());
        return std::nullopt;
    }
    try {
        return ScenarioReader::read(QFileInfo(path).completeBaseName(), file.readAll());
    } catch (const JsonTrouble &trouble) {
        *error = QStringLiteral("%1: %2").arg(path, trouble.text);
        return std::nullopt;
    }
}

std::optional<Scenario> Scenario::find(const QString &nameOrPath, const QString &folder, QString *error)
{
    if (nameOrPath.contains(QLatin1Char('/')) || nameOrPath.endsWith(QLatin1String(".json")))
        return load(nameOrPath, error);
    const QStringList known = names(folder);
    if (known.contains(nameOrPath))
        return load(QDir(folder).filePath(nameOrPath + QLatin1String(".json")), error);
    *error = known.isEmpty()
                 ? QStringLiteral("no scenario \"%1\": there are none in %2").arg(nameOrPath, folder)
                 : QStringLiteral("no scenario \"%1\"; there are %2")
                       .arg(nameOrPath, known.join(QStringLiteral(", ")));
    return std::nullopt;
}

QString Scenario::standardFolder()
{
    return QDir::cleanPath(QCoreApplication::applicationDirPath() +
                           QLatin1String("/../share/vesk-sandbox/scenarios"));
}

QStringList Scenario::names(const QString &folder)
{
    QStringList names;
    const QStringList files =
        QDir(folder).entryList({QStringLiteral("*.json")}, QDir::Files | QDir::Readable, QDir::Name);
    for (const QString &file : files)
        names += QFileInfo(file).completeBaseName();
    return names;
}

QStringList Scenario::endpointNames()
{
    return {QStringLiteral("ca_cert"),       QStringLiteral("status"), QStringLiteral("auth"),
            QStringLiteral("join"),          QStringLiteral("rule"),   QStringLiteral("verify_name"),
            QStringLiteral("remove_status"), QStringLiteral("remove"), QStringLiteral("department"),
            QStringLiteral("account")};
}

} // namespace sandbox
