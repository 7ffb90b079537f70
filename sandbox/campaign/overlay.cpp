// SPDX-License-Identifier: Apache-2.0
#include "campaign/overlay.h"

namespace sandbox {

QJsonObject overlaid(const QJsonObject &base, const QJsonObject &patch)
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

void setAt(QJsonObject &object, const QString &path, const QJsonValue &value)
{
    const auto dot = path.indexOf(QLatin1Char('.'));
    const QString key = path.left(dot);
    if (dot < 0) {
        object.insert(key, value);
        return;
    }
    QJsonObject inner = object.value(key).toObject();
    setAt(inner, path.mid(dot + 1), value);
    object.insert(key, inner);
}

} // namespace sandbox
