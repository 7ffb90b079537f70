// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>

namespace sandbox {

// `base` with `patch` laid over it: objects are merged key by key, anything else is replaced.
QJsonObject overlaid(const QJsonObject &base, const QJsonObject &patch);

// Sets or (undefined value) removes what stands at a dotted path: "data.key".
void setAt(QJsonObject &object, const QString &path, const QJsonValue &value);

} // namespace sandbox
