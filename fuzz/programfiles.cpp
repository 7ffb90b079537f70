// SPDX-License-Identifier: Apache-2.0
#include "programfiles.h"

#include "require.h"
#include "wellknownpaths.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace programfiles {

bool exists(const char *path)
{
    return QFile::exists(QString::fromUtf8(path));
}

QByteArray read(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

void write(const QString &path, const QByteArray &content)
{
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly)) {
        QDir().mkpath(QFileInfo(path).path());
        fuzz::require(file.open(QIODevice::WriteOnly), "a file of the isolated view can be written");
    }
    fuzz::require(file.write(content) == content.size(), "a file of the isolated view is written whole");
}

void removeStaged()
{
    for (const char *path :
         {vesk::kTmpCaCertPath, vesk::kTmpPublicKeyPath, vesk::kTmpPrivateKeyPath, vesk::kTmpUserinfoPath})
        QFile::remove(QString::fromUtf8(path));
}

QString stagedRecord()
{
    return QString::fromUtf8(vesk::kTmpUserinfoPath);
}

bool isPrivate(const QString &path)
{
    const auto others = QFile::ReadGroup | QFile::WriteGroup | QFile::ExeGroup | QFile::ReadOther |
                        QFile::WriteOther | QFile::ExeOther;
    return QFile::exists(path) && (QFile::permissions(path) & others) == 0;
}

} // namespace programfiles
