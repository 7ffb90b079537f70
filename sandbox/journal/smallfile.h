// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QJsonObject>
#include <QString>

#include <optional>

namespace sandbox {

enum class FileAccess {
    Everyone, // mode 0644
    OwnerOnly // mode 0600 from the first moment on
};

// Reading and writing of small files, for every part of the sandbox. Where an Error is thrown, it begins with
// the path.
namespace smallfile {

// The whole content; throws when the file cannot be read, or is nothing.
QByteArray load(const QString &path);
std::optional<QByteArray> read(const QString &path);

// Writes a file whole or not at all, replacing an older one of whatever mode; its directory must exist.
// Throws when it cannot be written, or is false.
void save(const QString &path, const QByteArray &content, FileAccess access = FileAccess::Everyone);
bool write(const QString &path, const QByteArray &content, FileAccess access = FileAccess::Everyone);

// A file, a link, or a directory with all that is in it.
void removeAll(const QString &path);

// An empty object where there is no such file or no object in it.
QJsonObject readObject(const QString &path);
// As save(), indented.
void saveObject(const QString &path, const QJsonObject &object, FileAccess access = FileAccess::Everyone);

} // namespace smallfile

} // namespace sandbox
