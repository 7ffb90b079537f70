// SPDX-License-Identifier: Apache-2.0
#include "campaign/jsonfile.h"

#include <QFile>
#include <QJsonDocument>

namespace sandbox {

QJsonObject jsonfile::read(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QJsonDocument::fromJson(file.readAll()).object() : QJsonObject();
}

bool jsonfile::write(const QString &path, const QJsonObject &object)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(QJsonDocument(object).toJson()) > 0;
}

} // namespace sandbox
