// SPDX-License-Identifier: Apache-2.0
#include "play/obstacles.h"

#include "journal/smallfile.h"
#include "play/obstaclekinds.h"
#include "scenario/json.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <sys/stat.h>

namespace sandbox {

namespace {

const QString kOriginal = QStringLiteral("original"); // name of what stood there, below kept()
const QString kInode = QStringLiteral("inode");

QString kept(const StateFolder &state)
{
    return state.at("kept");
}

QString listOf(const StateFolder &state)
{
    return state.at("kept/places.json");
}

bool exists(const QString &path)
{
    struct stat status = {};
    return ::lstat(QFile::encodeName(path).constData(), &status) == 0;
}

// Tells whether it is still the same that stands there.
QString inodeOf(const QString &path)
{
    struct stat status = {};
    return ::lstat(QFile::encodeName(path).constData(), &status) == 0 ? QString::number(status.st_ino)
                                                                      : QString();
}

void remove(const QString &path)
{
    const QFileInfo info(path);
    if (info.isDir() && !info.isSymLink())
        QDir(path).removeRecursively();
    else
        QFile::remove(path);
}

// Folders on the way are the user's own, as the program makes them.
bool makeWay(const QString &path)
{
    const QString folder = QFileInfo(path).path();
    return QFileInfo(folder).isDir() ||
           (QDir().mkpath(folder) && ::chmod(QFile::encodeName(folder).constData(), 0700) == 0);
}

} // namespace

bool obstacles::put(const StateFolder &state, const QJsonObject &places, QString *error)
{
    QJsonObject list;
    if (places.isEmpty())
        return true;
    if (!QDir().mkpath(kept(state))) {
        *error = QStringLiteral("cannot make %1").arg(kept(state));
        return false;
    }
    for (auto place = places.begin(); place != places.end(); ++place) {
        const QString path = state.inside(place.key());
        QJsonObject entry;
        if (exists(path)) {
            entry.insert(kOriginal, QString::number(list.size()));
            QFile::rename(path, kept(state) + QLatin1Char('/') + QString::number(list.size()));
        }
        const QString original = entry.contains(kOriginal)
                                     ? kept(state) + QLatin1Char('/') + entry.value(kOriginal).toString()
                                     : QString();
        if (!makeWay(path) || !makeObstacle(state, path, original, place.value(), error)) {
            if (error->isEmpty())
                *error = QStringLiteral("cannot make the way to %1").arg(path);
            return false;
        }
        entry.insert(kInode, inodeOf(path));
        list.insert(place.key(), entry);
    }
    for (const QString &target : obstacleTargets())
        list.insert(target, QJsonObject{{kInode, inodeOf(state.inside(target))}});
    return smallfile::writeObject(listOf(state), list);
}

void obstacles::clear(const StateFolder &state)
{
    const QJsonObject list = smallfile::readObject(listOf(state));
    QFile::remove(listOf(state));
    for (auto place = list.begin(); place != list.end(); ++place) {
        const QString path = state.inside(place.key());
        const QJsonObject entry = place.value().toObject();
        if (exists(path) && inodeOf(path) == entry.value(kInode).toString())
            remove(path);
        if (entry.contains(kOriginal) && !exists(path))
            QFile::rename(kept(state) + QLatin1Char('/') + entry.value(kOriginal).toString(), path);
    }
}

} // namespace sandbox
