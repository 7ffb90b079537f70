// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonObject>
#include <QString>

namespace sandbox {

namespace jsonfile {

// An empty object where there is no such file or no object in it.
QJsonObject read(const QString &path);
bool write(const QString &path, const QJsonObject &object);

} // namespace jsonfile

} // namespace sandbox
