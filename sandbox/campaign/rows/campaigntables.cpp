// SPDX-License-Identifier: Apache-2.0
#include "campaign/rows/campaigntables.h"

#include "campaign/rows/tablereader.h"
#include "scenario/schemacheck.h"

#include <QCoreApplication>
#include <QDir>

#include <algorithm>

namespace sandbox {

QString CampaignTables::standardDirectory()
{
    return QDir::cleanPath(QCoreApplication::applicationDirPath() +
                           QLatin1String("/../share/vesk-sandbox/campaign"));
}

std::optional<CampaignTables> CampaignTables::load(const QString &directory, QString *error,
                                                   const QString &row)
{
    const QString journeys = QStringLiteral("journeys");
    const QString files = QStringLiteral("files");
    const QString otherNames = QStringLiteral("names");
    const bool isOne = row.contains(QLatin1Char('/'));
    QStringList names{journeys, files};
    for (const QString &entry :
         QDir(directory).entryList({QStringLiteral("*.json")}, QDir::Files, QDir::Name)) {
        const QString name = entry.chopped(5);
        const bool isWanted = !isOne || name == row.section(QLatin1Char('/'), 0, 0);
        if (isWanted && !names.contains(name) && name != otherNames)
            names.append(name);
    }
    if (!isOne)
        names.append(otherNames); // of rows, which are there by then
    CampaignTables tables;
    for (const QString &name : names) {
        const bool isGroup = name != journeys && name != files && name != otherNames;
        const QString path = QDir(directory).filePath(name + QStringLiteral(".json"));
        const auto top = schemacheck::read(path, isGroup ? QStringLiteral("group") : name, error);
        if (!top)
            return std::nullopt;
        try {
            if (name == journeys)
                TableReader::readJourneys(*top, tables);
            else if (name == files)
                TableReader::readFiles(*top, tables);
            else if (name == otherNames)
                TableReader::readNames(*top, tables);
            else
                TableReader(tables, name).read(*top);
        } catch (const TableError &slip) {
            *error = QStringLiteral("%1: %2").arg(path, slip.text);
            return std::nullopt;
        }
    }
    return tables;
}

const Row *CampaignTables::row(const QString &name) const
{
    const QString id = m_otherNames.value(name, name);
    const auto *found =
        std::find_if(m_rows.begin(), m_rows.end(), [&id](const Row &each) { return each.id() == id; });
    return found == m_rows.end() ? nullptr : found;
}

} // namespace sandbox
