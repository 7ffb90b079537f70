// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QString>

// Reads a JSON file that people write and holds it against scenario.schema.json, which is the one place that
// says which keys and values there are.
namespace sandbox::schemacheck {

// definition: a name under "definitions" of the schema, such as "scenario". Throws an Error that names file
// and key where the file cannot be read, is no JSON or breaks the schema.
QJsonObject read(const QString &path, const QString &definition);

// What is wrong with `object`, on one line that names the key; empty: nothing is.
QString complaint(const QJsonObject &object, const QString &definition);

} // namespace sandbox::schemacheck
