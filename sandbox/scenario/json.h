// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QStringList>

// Reads scenarios and tables whose keys and types the schema has checked.
namespace sandbox::json {

// What stands at `key`; empty where nothing of that type does.
QString text(const QJsonObject &object, const char *key);
QStringList texts(const QJsonObject &object, const char *key);
QJsonObject object(const QJsonObject &object, const char *key);
QJsonArray array(const QJsonObject &object, const char *key);
bool flag(const QJsonObject &object, const char *key, bool otherwise = false);
int number(const QJsonObject &object, const char *key, int otherwise);

// `base` with `patch` laid over it: objects are merged key by key, anything else is replaced.
QJsonObject overlaid(const QJsonObject &base, const QJsonObject &patch);

} // namespace sandbox::json
