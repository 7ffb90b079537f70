// SPDX-License-Identifier: Apache-2.0
#include "journal/smallfile.h"

#include <QFile>
#include <QJsonDocument>
#include <QTemporaryFile>

#include <cerrno>
#include <cstdio>
#include <cstring>

#include <sys/stat.h>

namespace sandbox {

std::optional<QByteArray> smallfile::read(const QString &path, QString *error)
{
    QFile file(path);
    if (file.open(QIODevice::ReadOnly))
        return file.readAll();
    if (error != nullptr)
        *error = QStringLiteral("%1: cannot be read: %2").arg(path, file.errorString());
    return std::nullopt;
}

bool smallfile::write(const QString &path, const QByteArray &content, FileAccess access, QString *error)
{
    // Made with mode 0600, where QSaveFile would take the mode of the older file.
    QTemporaryFile file(path + QStringLiteral(".XXXXXX"));
    QString reason;
    if (!file.open() || file.write(content) != content.size() || !file.flush())
        reason = file.errorString();
    else if ((access == FileAccess::Everyone && ::fchmod(file.handle(), 0644) != 0) ||
             std::rename(QFile::encodeName(file.fileName()).constData(),
                         QFile::encodeName(path).constData()) != 0)
        reason = QString::fromLocal8Bit(std::strerror(errno));
    file.setAutoRemove(!reason.isEmpty());
    if (!reason.isEmpty() && error != nullptr)
        *error = QStringLiteral("%1: cannot be written: %2").arg(path, reason);
    return reason.isEmpty();
}

QJsonObject smallfile::readObject(const QString &path)
{
    return QJsonDocument::fromJson(smallfile::read(path).value_or(QByteArray())).object();
}

bool smallfile::writeObject(const QString &path, const QJsonObject &object, FileAccess access, QString *error)
{
    return smallfile::write(path, QJsonDocument(object).toJson(), access, error);
}

} // namespace sandbox
