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

// Reading and writing of small files, for every part of the sandbox. `error` may be null; on failure it
// becomes one line that begins with the path.
namespace smallfile {

// The whole content; nothing when the file cannot be read.
std::optional<QByteArray> read(const QString &path, QString *error = nullptr);

// Writes a file whole or not at all, replacing an older one of whatever mode; its directory must exist.
bool write(const QString &path, const QByteArray &content, FileAccess access = FileAccess::Everyone,
           QString *error = nullptr);

// An empty object where there is no such file or no object in it.
QJsonObject readObject(const QString &path);
// As write(), indented.
bool writeObject(const QString &path, const QJsonObject &object, FileAccess access = FileAccess::Everyone,
                 QString *error = nullptr);

} // namespace smallfile

} // namespace sandbox
