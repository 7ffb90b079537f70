// SPDX-License-Identifier: Apache-2.0
#include "scenario/json.h"

#include <QJsonArray>

namespace sandbox {

QString json::text(const QJsonObject &object, const char *key)
{
    return object.value(QLatin1String(key)).toString();
}

QStringList json::texts(const QJsonObject &object, const char *key)
{
    QStringList result;
    for (const QJsonValue &each : array(object, key))
        result.append(each.toString());
    return result;
}

QJsonObject json::object(const QJsonObject &object, const char *key)
{
    return object.value(QLatin1String(key)).toObject();
}

QJsonArray json::array(const QJsonObject &object, const char *key)
{
    return object.value(QLatin1String(key)).toArray();
}

bool json::flag(const QJsonObject &object, const char *key, bool otherwise)
{
    return object.value(QLatin1String(key)).toBool(otherwise);
}

int json::number(const QJsonObject &object, const char *key, int otherwise)
{
    return object.value(QLatin1String(key)).toInt(otherwise);
}

QJsonObject json::overlaid(const QJsonObject &base, const QJsonObject &patch)
{
    QJsonObject result = base;
    for (auto entry = patch.begin(); entry != patch.end(); ++entry) {
        const QJsonValue before = result.value(entry.key());
        const bool merges = before.isObject() && entry.value().isObject();
        result.insert(entry.key(), merges ? overlaid(before.toObject(), entry.value().toObject())
                                          : QJsonValue(entry.value()));
    }
    return result;
}

} // namespace sandbox
