// SPDX-License-Identifier: Apache-2.0
#include "play/obstaclekinds.h"

#include "certificateauthority.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QJsonObject>

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
const QString kOtherFolder = QStringLiteral("/tmp/elsewhere");
const QString kOtherFile = QStringLiteral("/tmp/precious");

// All that an obstacle can be made of.
struct Place
{
    const StateFolder &state;
    QString path;
    QByteArray before; // what stood there, or an old line

    QByteArray name() const { return QFile::encodeName(path); }
};

using Maker = std::function<bool(const Place &)>;

QByteArray contentOf(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

bool write(const QString &path, const QByteArray &content)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(content) == content.size();
}

Maker file(const std::function<QByteArray(const Place &)> &content, mode_t mode = 0644,
           bool isForeign = false)
{
    return [=](const Place &place) {
        return write(place.path, content(place)) && ::chmod(place.name().constData(), mode) == 0 &&
               (!isForeign || ::chown(place.name().constData(), kAnotherUser, kAnotherUser) == 0);
    };
}

Maker folder(mode_t mode, bool isForeign = false)
{
    return [=](const Place &place) {
        return ::mkdir(place.name().constData(), 0700) == 0 && ::chmod(place.name().constData(), mode) == 0 &&
               (!isForeign || ::chown(place.name().constData(), kAnotherUser, kAnotherUser) == 0);
    };
}

// Relative, so that it leads to the same thing for the program and for us.
bool link(const Place &place, const QString &target)
{
    const QString relative = QFileInfo(place.path).dir().relativeFilePath(place.state.inside(target));
    return ::symlink(QFile::encodeName(relative).constData(), place.name().constData()) == 0;
}

QByteArray before(const Place &place)
{
    return place.before;
}

QByteArray otherCa(const Place & /*place*/)
{
    const auto other = CertificateAuthority::create(QStringLiteral("Another CA"), nullptr);
    return other ? other->certificatePem() : QByteArray();
}

// Certificate and key are asked for one after the other and have to fit.
const KeyPair &otherPair(const StateFolder &state)
{
    static const KeyPair pair = [&state] {
        const auto authority =
            CertificateAuthority::load(state.at("server/ca.crt"), state.at("server/ca.key"), nullptr);
        const auto issued =
            authority ? authority->issueClient(QStringLiteral("another"), nullptr) : std::nullopt;
        return issued.value_or(KeyPair());
    }();
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

Maker links(const QString &target, const std::function<bool(const QString &)> &makeTarget)
{
    return [=](const Place &place) {
        return makeTarget(place.state.inside(target)) && link(place, target);
    };
}

const std::map<QString, Maker> &makers()
{
    const auto nothing = [](const Place & /*place*/) {
        return QByteArray();
    };
    const auto garbage = [](const Place & /*place*/) {
        return QByteArray("\x01\xfe no such thing\n");
    };
    const auto half = [](const Place &place) {
        return place.before.left(place.before.size() / 2);
    };
    static const std::map<QString, Maker> all = {
        {QStringLiteral("absent"),
         [](const Place & /*place*/) {
             return true;
         }},
        {QStringLiteral("empty"), file(nothing)},
        {QStringLiteral("garbage"), file(garbage)},
        {QStringLiteral("truncated"), file(half)},
        {QStringLiteral("unreadable"), file(before, 0000)},
        {QStringLiteral("read-only"), file(before, 0444)},
        {QStringLiteral("readable"), file(before, 0644)},
        {QStringLiteral("foreign"), file(before, 0644, true)},
        {QStringLiteral("huge"),
         [](const Place &place) {
             return write(place.path, {}) && ::truncate(place.name().constData(), kHuge) == 0;
         }},
        {QStringLiteral("folder"), folder(0755)},
        {QStringLiteral("open-folder"), folder(0777)},
        {QStringLiteral("sticky-folder"), folder(01777)},
        {QStringLiteral("foreign-folder"), folder(0755, true)},
        {QStringLiteral("foreign-sticky-folder"), folder(01777, true)},
        {QStringLiteral("foreign-open-folder"), folder(0777, true)},
        {QStringLiteral("fifo"),
         [](const Place &place) {
             return ::mkfifo(place.name().constData(), 0644) == 0;
         }},
        {QStringLiteral("device"),
         [](const Place &place) {
             return ::symlink("/dev/zero", place.name().constData()) == 0;
         }},
        {QStringLiteral("dangling"),
         [](const Place &place) {
             return link(place, kNowhere);
         }},
        {QStringLiteral("link-folder"), links(kOtherFolder,
                                              [](const QString &target) {
                                                  return ::mkdir(QFile::encodeName(target).constData(),
                                                                 0700) == 0;
                                              })},
        {QStringLiteral("link-file"),
         links(kOtherFile,
               [](const QString &target) { return write(target, "what the user would miss\n"); })},
        {QStringLiteral("other-ca"), file(otherCa)},
        {QStringLiteral("other-certificate"),
         file([](const Place &place) { return otherPair(place.state).certificatePem; })},
        {QStringLiteral("other-key"),
         file([](const Place &place) { return otherPair(place.state).keyPem; }, 0600)},
        {QStringLiteral("filler"), fill},
    };
    return all;
}

Maker makerOf(const QJsonValue &kind)
{
    if (kind.isObject()) {
        const QJsonObject object = kind.toObject();
        QByteArray content =
            object.contains(QLatin1String("hex"))
                ? QByteArray::fromHex(object.value(QLatin1String("hex")).toString().toLatin1())
                : object.value(QLatin1String("text")).toString().toUtf8();
        return file([content](const Place & /*place*/) { return content; });
    }
    const auto found = makers().find(kind.toString());
    return found == makers().end() ? Maker() : found->second;
}

} // namespace

bool makeObstacle(const StateFolder &state, const QString &path, const QString &original,
                  const QJsonValue &kind, QString *error)
{
    const Place place{state, path, original.isEmpty() ? QByteArray("old\n") : contentOf(original)};
    const Maker maker = makerOf(kind);
    errno = 0;
    if (maker && maker(place))
        return true;
    *error = maker ? QStringLiteral("cannot put \"%1\" at %2: %3")
                         .arg(kind.toString(), path, QString::fromLocal8Bit(std::strerror(errno)))
                   : QStringLiteral("places: there is no \"%1\"").arg(kind.toString());
    return false;
}

QStringList obstacleTargets()
{
    return {kNowhere, kOtherFolder, kOtherFile};
}

} // namespace sandbox
