// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "isolatedfiles.h"
#include "require.h"
#include "wellknownpaths.h"

// The program's own files in the isolated view.
namespace programfiles {

inline bool exists(const char *path)
{
    return QFile::exists(QString::fromUtf8(path));
}

// Ends the process when it fails.
inline void write(const QString &path, const QByteArray &content)
{
    fuzz::require(isolatedfiles::write(path, content), "a file of the isolated view can be written");
}

// Removes all that the program stages: CA, certificate, key and record.
inline void removeStaged()
{
    for (const char *path :
         {vesk::kTmpCaCertPath, vesk::kTmpPublicKeyPath, vesk::kTmpPrivateKeyPath, vesk::kTmpUserinfoPath})
        QFile::remove(QString::fromUtf8(path));
}

inline QByteArray stagedRecord()
{
    return isolatedfiles::read(QString::fromUtf8(vesk::kTmpUserinfoPath));
}

// Only the owner may read or write it.
inline bool isPrivate(const char *path)
{
    const auto others = QFile::ReadGroup | QFile::WriteGroup | QFile::ExeGroup | QFile::ReadOther |
                        QFile::WriteOther | QFile::ExeOther;
    return exists(path) && (QFile::permissions(QString::fromUtf8(path)) & others) == 0;
}

} // namespace programfiles
