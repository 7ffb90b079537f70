// SPDX-License-Identifier: Apache-2.0
#include "scenario/schemacheck.h"

#include "data/data.h"
#include "journal/error.h"
#include "journal/journal.h"
#include "journal/smallfile.h"

#include <QJsonDocument>
#include <QStringList>

#include <valijson/adapters/qtjson_adapter.hpp>
#include <valijson/schema.hpp>
#include <valijson/schema_parser.hpp>
#include <valijson/validation_results.hpp>
#include <valijson/validator.hpp>

namespace sandbox {

namespace {

// "<root>[server][endpoints]" as "server.endpoints". A key may hold any character.
QString pathOf(const std::vector<std::string> &context)
{
    QStringList keys;
    for (const std::string &each : context)
        keys.append(QString::fromStdString(each).remove(QLatin1Char('[')).remove(QLatin1Char(']')));
    keys.removeAll(QStringLiteral("<root>"));
    return keys.join(QLatin1Char('.'));
}

} // namespace

QString schemacheck::complaint(const QJsonObject &object, const QString &definition)
{
    QJsonObject top = QJsonDocument::fromJson(data::read("scenario.schema.json")).object();
    top.insert(QStringLiteral("$ref"), QStringLiteral("#/definitions/") + definition);
    const QJsonValue topValue(top);
    valijson::Schema schema;
    valijson::SchemaParser().populateSchema(valijson::adapters::QtJsonAdapter(topValue), schema);
    const QJsonValue value(object);
    valijson::ValidationResults results;
    if (valijson::Validator().validate(schema, valijson::adapters::QtJsonAdapter(value), &results))
        return {};
    // The innermost error is the most precise.
    valijson::ValidationResults::Error told;
    for (const auto &error : results) {
        if (error.context.size() > told.context.size())
            told = error;
    }
    return onOneLine(
        QStringLiteral("\"%1\": %2").arg(pathOf(told.context), QString::fromStdString(told.description)));
}

QJsonObject schemacheck::read(const QString &path, const QString &definition)
{
    const QByteArray text = smallfile::load(path);
    QJsonParseError parseError;
    const QJsonDocument document = QJsonDocument::fromJson(text, &parseError);
    QString reason;
    if (parseError.error != QJsonParseError::NoError)
        reason = QStringLiteral("line %1 is not JSON: %2")
                     .arg(text.left(parseError.offset).count('\n') + 1)
                     .arg(parseError.errorString());
    else if (!document.isObject())
        reason = QStringLiteral("the top is not an object");
    else
        reason = complaint(document.object(), definition);
    if (!reason.isEmpty())
        throw Error(QStringLiteral("%1: %2").arg(path, reason));
    return document.object();
}

} // namespace sandbox
