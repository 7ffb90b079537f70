// SPDX-License-Identifier: Apache-2.0
#include "journal/smallfile.h"

#include "journal/error.h"

#include <QFile>
#include <QJsonDocument>
#include <QTemporaryFile>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>

#include <sys/stat.h>

namespace sandbox {

QByteArray smallfile::load(const QString &path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        throw Error(QStringLiteral("%1: cannot be read: %2").arg(path, file.errorString()));
    return file.readAll();
}

std::optional<QByteArray> smallfile::read(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? std::optional(file.readAll()) : std::nullopt;
}

void smallfile::save(const QString &path, const QByteArray &content, FileAccess access)
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
    if (!reason.isEmpty())
        throw Error(QStringLiteral("%1: cannot be written: %2").arg(path, reason));
}

bool smallfile::write(const QString &path, const QByteArray &content, FileAccess access)
{
    QString error;
    return attempt(&error, [&] { save(path, content, access); });
}

void smallfile::removeAll(const QString &path)
{
    std::error_code ignored;
    std::filesystem::remove_all(QFile::encodeName(path).toStdString(), ignored);
}

QJsonObject smallfile::readObject(const QString &path)
{
    return QJsonDocument::fromJson(smallfile::read(path).value_or(QByteArray())).object();
}

void smallfile::saveObject(const QString &path, const QJsonObject &object, FileAccess access)
{
    save(path, QJsonDocument(object).toJson(), access);
}

} // namespace sandbox
