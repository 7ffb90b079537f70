// SPDX-License-Identifier: Apache-2.0
#include "backend.h"

#include "view.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <algorithm>

#include <sys/mman.h>
#include <unistd.h>

namespace sandbox {

namespace {

QStringList words(const char *line)
{
    return QString::fromLatin1(line).split(QLatin1Char(' '));
}

// Root keeps all capabilities else.
const QStringList kConfinement = words("--unshare-pid --unshare-ipc --die-with-parent --cap-drop ALL");
// Root needs no capability to write the kernel's settings.
const QStringList kKernelDirectories = words("--dev /dev --proc /proc --remount-ro /proc");

bool isInside(const QString &path, const QString &directory)
{
    return path.startsWith(directory + QLatin1Char('/'));
}

// QFile::symLinkTarget() would make a relative target absolute.
QString readLink(const QString &path)
{
    QByteArray target(4096, '\0');
    const auto size =
        ::readlink(QFile::encodeName(path).constData(), target.data(), static_cast<size_t>(target.size()));
    return QFile::decodeName(target.left(static_cast<int>(std::max<ssize_t>(size, 0))));
}

// Lays out the machine's own entries around the paths that something else is mounted on.
QStringList layOut(const QDir &directory, const QStringList &holes)
{
    QStringList arguments;
    const auto all = QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot;
    for (const QFileInfo &entry : directory.entryInfoList(all, QDir::Name)) {
        const QString path = entry.filePath();
        const bool isRebuilt = std::any_of(holes.cbegin(), holes.cend(),
                                           [&](const QString &hole) { return isInside(hole, path); });
        if (holes.contains(path))
            continue;
        if (entry.isSymLink())
            arguments << QStringLiteral("--symlink") << readLink(path) << path;
        else if (!isRebuilt)
            arguments << QStringLiteral("--ro-bind") << path << path;
        else
            arguments << QStringLiteral("--dir") << path << layOut(QDir(path), holes);
    }
    return arguments;
}

QStringList holesOf(const View &view)
{
    QStringList holes = words("/dev /proc /run /tmp /etc/vesk /etc/hostname /etc/hosts /usr/share/vesk");
    for (const Bind &bind : view.binds()) {
        if (!QFileInfo::exists(bind.inside))
            holes.append(bind.inside);
    }
    return holes;
}

// A descriptor from which bubblewrap reads its arguments: there are too many for a readable process list.
int argumentFile(const QStringList &arguments)
{
    const int file = ::memfd_create("bwrap-arguments", 0);
    QByteArray content;
    for (const QString &argument : arguments)
        content += QFile::encodeName(argument) + '\0';
    const bool written =
        ::write(file, content.constData(), static_cast<size_t>(content.size())) == content.size();
    if (!written || ::lseek(file, 0, SEEK_SET) != 0)
        qFatal("cannot hand %d bytes of arguments to bubblewrap", content.size());
    return file;
}

} // namespace

QStringList Bubblewrap::trialArguments()
{
    return kConfinement + words("--ro-bind / /") + kKernelDirectories + words("--tmpfs /tmp true");
}

QStringList Bubblewrap::commandLine(const View &view, const RunDirectory & /*run*/, const QStringList &stage)
{
    QStringList arguments = kConfinement + layOut(QDir::root(), holesOf(view)) + kKernelDirectories;
    for (const Bind &bind : view.binds())
        arguments << QLatin1String(bind.writable ? "--bind" : "--ro-bind") << bind.host << bind.inside;
    for (const QString &path : view.readOnly() + QStringList{QStringLiteral("/")})
        arguments << QStringLiteral("--remount-ro") << path;
    arguments << QStringLiteral("--chdir") << view.workingDirectory();
    return words("bwrap --args") << QString::number(argumentFile(arguments)) << QStringLiteral("--") << stage;
}

} // namespace sandbox
