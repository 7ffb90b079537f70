// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QString>

#include <optional>

// Reads a JSON file that people write and holds it against scenario.schema.json, which is the one place that
// says which keys and values there are.
namespace sandbox::schemacheck {

// definition: a name under "definitions" of the schema, such as "scenario". Nothing where the file cannot be
// read, is no JSON or breaks the schema, with one line in `error` that names file and key.
std::optional<QJsonObject> read(const QString &path, const QString &definition, QString *error);

// What is wrong with `object`, on one line that names the key; empty: nothing is.
QString complaint(const QJsonObject &object, const QString &definition);

} // namespace sandbox::schemacheck
