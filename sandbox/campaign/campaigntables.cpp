// SPDX-License-Identifier: Apache-2.0
#include "campaign/campaigntables.h"

#include "campaign/tablesreader.h"
#include "scenario/strictobject.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>

#include <algorithm>

namespace sandbox {

namespace {

StrictObject read(const QString &path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        throw JsonTrouble{QStringLiteral("cannot be read: %1").arg(file.errorString())};
    return StrictObject::parse(file.readAll());
}

} // namespace

QString CampaignTables::standardFolder()
{
    return QDir::cleanPath(QCoreApplication::applicationDirPath() +
                           QLatin1String("/../share/vesk-sandbox/campaign"));
}

std::optional<CampaignTables> CampaignTables::load(const QString &folder, QString *error)
{
    const QStringList shared{QStringLiteral("journeys.json"), QStringLiteral("files.json")};
    QStringList names = QDir(folder).entryList({QStringLiteral("*.json")}, QDir::Files, QDir::Name);
    for (const QString &name : shared)
        names.removeAll(name);
    CampaignTables tables;
    QString path;
    try {
        for (const QString &name : shared + names) {
            path = QDir(folder).filePath(name);
            StrictObject top = read(path);
            if (name == shared.at(0))
                TablesReader::readJourneys(top, tables);
            else if (name == shared.at(1))
                TablesReader::readFiles(top, tables);
            else
                TablesReader(tables, name.chopped(5)).read(top);
        }
    } catch (const JsonTrouble &trouble) {
        *error = QStringLiteral("%1: %2").arg(path, trouble.text);
        return std::nullopt;
    }
    return tables;
}

const Row *CampaignTables::row(const QString &id) const
{
    const auto *found =
        std::find_if(m_rows.begin(), m_rows.end(), [&id](const Row &each) { return each.id() == id; });
    return found == m_rows.end() ? nullptr : found;
}

} // namespace sandbox
