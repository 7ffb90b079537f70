// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QString>

// Files of an isolated test, at the absolute paths that the program uses.
namespace isolatedfiles {

inline void remove(const QString &path)
{
    if (QFileInfo(path).isDir() && !QFileInfo(path).isSymLink())
        QDir(path).removeRecursively();
    else
        QFile::remove(path);
}

inline bool write(const QString &path, const QByteArray &content)
{
    remove(path);
    QDir().mkpath(QFileInfo(path).path());
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(content) == content.size();
}

// What cannot be opened as a file, for root neither.
inline bool writeDirectory(const QString &path)
{
    remove(path);
    return QDir().mkpath(path);
}

inline QByteArray read(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

} // namespace isolatedfiles
