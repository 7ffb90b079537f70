// SPDX-License-Identifier: Apache-2.0
#include "play/obstacles.h"

#include "certificateauthority.h"
#include "journal/error.h"
#include "journal/smallfile.h"

#include <QDir>
#include <QFileInfo>

#include <cerrno>
#include <cstring>
#include <functional>
#include <map>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr uid_t kAnotherUser = 65534;
constexpr qint64 kHuge = 1LL << 30;

const QString kNowhere = QStringLiteral("/tmp/nowhere");
const QString kOtherDirectory = QStringLiteral("/tmp/elsewhere");
const QString kOtherFile = QStringLiteral("/tmp/precious");

// All that an obstacle can be made of.
struct Place
{
    const StateDirectory &state;
    QString path;
    QByteArray before; // what stood there, or an old line

    QByteArray name() const { return QFile::encodeName(path); }
};

using Maker = std::function<bool(const Place &)>;

using Content = QByteArray (*)(const Place &place);

bool give(const Place &place, mode_t mode, bool isForeign)
{
    return ::chmod(place.name().constData(), mode) == 0 &&
           (!isForeign || ::chown(place.name().constData(), kAnotherUser, kAnotherUser) == 0);
}

Maker file(Content content, mode_t mode = 0644, bool isForeign = false)
{
    return [=](const Place &place) {
        return smallfile::write(place.path, content(place)) && give(place, mode, isForeign);
    };
}

Maker directory(mode_t mode, bool isForeign = false)
{
    return [=](const Place &place) {
        return ::mkdir(place.name().constData(), 0700) == 0 && give(place, mode, isForeign);
    };
}

// Relative, so that it leads to the same thing for the program and for us.
Maker link(const QString &target)
{
    return [=](const Place &place) {
        const QString inside = place.state.inside(target);
        const bool isThere =
            target == kNowhere ||
            (target == kOtherFile ? smallfile::write(inside, "what the user would miss\n")
                                  : ::mkdir(QFile::encodeName(inside).constData(), 0700) == 0);
        const QString relative = QFileInfo(place.path).dir().relativeFilePath(inside);
        return isThere && ::symlink(QFile::encodeName(relative).constData(), place.name().constData()) == 0;
    };
}

// Certificate and key are asked for one after the other and have to fit.
const KeyPair &otherPair(const StateDirectory &state)
{
    static const KeyPair pair =
        CertificateAuthority::load(state.at("server/ca.crt"), state.at("server/ca.key"))
            .issueClient(QStringLiteral("another"));
    return pair;
}

// Until there is no room for another byte.
bool fill(const Place &place)
{
    const int descriptor = ::open(place.name().constData(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    const QByteArray block(1024, 'x');
    ssize_t written = 1;
    while (descriptor >= 0 && written > 0)
        written = ::write(descriptor, block.constData(), static_cast<size_t>(block.size()));
    const bool isFull = errno == ENOSPC;
    ::close(descriptor);
    return isFull;
}

const std::map<std::string, Maker> &makers()
{
    const auto before = [](const Place &place) {
        return place.before;
    };
    const auto half = [](const Place &place) {
        return place.before.left(place.before.size() / 2);
    };
    const auto nothing = [](const Place &) {
        return QByteArray();
    };
    const auto garbage = [](const Place &) {
        return QByteArray("\x01\xfe no such thing\n");
    };
    const auto otherCa = [](const Place &) {
        return CertificateAuthority::create(QStringLiteral("Another CA")).certificatePem();
    };
    const auto worldCa = [](const Place &place) {
        return smallfile::read(place.state.at("server/ca.crt")).value_or(QByteArray());
    };
    const auto otherCertificate = [](const Place &place) {
        return otherPair(place.state).certificatePem;
    };
    const auto otherKey = [](const Place &place) {
        return otherPair(place.state).keyPem;
    };
    static const std::map<std::string, Maker> all = {
        {"absent",
         [](const Place &) {
             return true;
         }},
        {"empty", file(nothing)},
        {"garbage", file(garbage)},
        {"truncated", file(half)},
        {"unreadable", file(before, 0000)},
        {"read-only", file(before, 0444)},
        {"readable", file(before, 0644)},
        {"foreign", file(before, 0644, true)},
        {"huge",
         [](const Place &place) {
             return smallfile::write(place.path, {}) && ::truncate(place.name().constData(), kHuge) == 0;
         }},
        {"directory", directory(0755)},
        {"open-directory", directory(0777)},
        {"sticky-directory", directory(01777)},
        {"foreign-directory", directory(0755, true)},
        {"foreign-sticky-directory", directory(01777, true)},
        {"foreign-open-directory", directory(0777, true)},
        {"fifo",
         [](const Place &place) {
             return ::mkfifo(place.name().constData(), 0644) == 0;
         }},
        {"device",
         [](const Place &place) {
             return ::symlink("/dev/zero", place.name().constData()) == 0;
         }},
        {"dangling", link(kNowhere)},
        {"link-directory", link(kOtherDirectory)},
        {"link-file", link(kOtherFile)},
        {"other-ca", file(otherCa)},
        {"world-ca", file(worldCa)},
        {"other-certificate", file(otherCertificate)},
        {"other-key", file(otherKey, 0600)},
        {"filler", fill},
    };
    return all;
}

// path: where it is to stand, with nothing there now. original: where the file lies that stood there before;
// empty: none did. Throws an Error.
void makeObstacle(const StateDirectory &state, const QString &path, const QString &original,
                  const QJsonValue &kind)
{
    errno = 0;
    const QJsonObject written = kind.toObject();
    if (kind.isObject() &&
        smallfile::write(path, json::text(written, "text").toUtf8() +
                                   QByteArray::fromHex(json::text(written, "hex").toLatin1())))
        return;
    const Place place{state, path,
                      original.isEmpty() ? QByteArray("old\n")
                                         : smallfile::read(original).value_or(QByteArray())};
    const auto maker = makers().find(kind.toString().toStdString());
    if (maker == makers().end() || !maker->second(place))
        throw Error(QStringLiteral("cannot put \"%1\" at %2: %3")
                        .arg(kind.toString(), path,
                             errno == 0 ? QStringLiteral("there is no such thing")
                                        : QString::fromLocal8Bit(std::strerror(errno))));
}

const QString kOriginal = QStringLiteral("original"); // name of what stood there, below kept()
const QString kInode = QStringLiteral("inode");

QString kept(const StateDirectory &state)
{
    return state.at("kept");
}

QString listOf(const StateDirectory &state)
{
    return state.at("kept/places.json");
}

// Tells whether it is still the same that stands there.
QString inodeOf(const QString &path)
{
    struct stat status = {};
    return ::lstat(QFile::encodeName(path).constData(), &status) == 0 ? QString::number(status.st_ino)
                                                                      : QString();
}

bool exists(const QString &path)
{
    return !inodeOf(path).isEmpty();
}

// Missing parents belong to the user, as those that the program makes.
bool makeParent(const QString &path)
{
    const QString directory = QFileInfo(path).path();
    return QFileInfo(directory).isDir() ||
           (QDir().mkpath(directory) && ::chmod(QFile::encodeName(directory).constData(), 0700) == 0);
}

} // namespace

void obstacles::put(const StateDirectory &state, const QJsonObject &places)
{
    if (places.isEmpty())
        return;
    const QDir keep(kept(state));
    if (!keep.mkpath(QStringLiteral(".")))
        throw Error(QStringLiteral("cannot create %1").arg(keep.path()));
    QJsonObject list;
    for (auto place = places.begin(); place != places.end(); ++place) {
        const QString path = state.inside(place.key());
        QJsonObject entry;
        QString original;
        if (exists(path)) {
            entry.insert(kOriginal, QString::number(list.size()));
            original = keep.filePath(QString::number(list.size()));
            QFile::rename(path, original);
        }
        if (!makeParent(path))
            throw Error(QStringLiteral("cannot create the directory of %1").arg(path));
        makeObstacle(state, path, original, place.value());
        entry.insert(kInode, inodeOf(path));
        list.insert(place.key(), entry);
    }
    for (const QString &target : QStringList{kNowhere, kOtherDirectory, kOtherFile})
        list.insert(target, QJsonObject{{kInode, inodeOf(state.inside(target))}});
    smallfile::saveObject(listOf(state), list);
}

void obstacles::clear(const StateDirectory &state)
{
    const QJsonObject list = smallfile::readObject(listOf(state));
    QFile::remove(listOf(state));
    for (auto place = list.begin(); place != list.end(); ++place) {
        const QString path = state.inside(place.key());
        const QJsonObject entry = place.value().toObject();
        if (exists(path) && inodeOf(path) == entry.value(kInode).toString())
            smallfile::removeAll(path);
        if (entry.contains(kOriginal) && !exists(path))
            QFile::rename(kept(state) + QLatin1Char('/') + entry.value(kOriginal).toString(), path);
    }
}

} // namespace sandbox
