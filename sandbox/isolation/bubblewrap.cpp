// SPDX-License-Identifier: Apache-2.0
#include "bubblewrap.h"

#include "runfolder.h"
#include "view.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <algorithm>

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

namespace sandbox {

namespace {

// Root keeps all capabilities else.
const QStringList kConfinement = {QStringLiteral("--unshare-pid"), QStringLiteral("--die-with-parent"),
                                  QStringLiteral("--cap-drop"), QStringLiteral("ALL")};
const QStringList kKernelFolders = {QStringLiteral("--dev"), QStringLiteral("/dev"), QStringLiteral("--proc"),
                                    QStringLiteral("/proc")};

// Lays out the machine's own entries around the paths that something else is mounted on.
class Layout
{
public:
    explicit Layout(QStringList holes)
        : m_holes(std::move(holes))
    {
    }

    QStringList arguments()
    {
        addEntries(QDir::root());
        return m_arguments;
    }

private:
    void addEntries(const QDir &folder)
    {
        const auto all = QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot;
        for (const QFileInfo &entry : folder.entryInfoList(all, QDir::Name))
            addEntry(entry);
    }

    void addEntry(const QFileInfo &entry)
    {
        const QString path = entry.filePath();
        if (m_holes.contains(path))
            return;
        if (entry.isSymLink())
            m_arguments << QStringLiteral("--symlink") << readLink(path) << path;
        else if (hasHoleBelow(path))
            addRebuilt(path);
        else
            m_arguments << QStringLiteral("--ro-bind") << path << path;
    }

    void addRebuilt(const QString &path)
    {
        // Files are copied into /etc, so it has to stay writable when the root is not.
        const bool etc = path == QLatin1String("/etc");
        m_arguments << (etc ? QStringLiteral("--tmpfs") : QStringLiteral("--dir")) << path;
        addEntries(QDir(path));
    }

    bool hasHoleBelow(const QString &path) const
    {
        return std::any_of(m_holes.cbegin(), m_holes.cend(),
                           [&](const QString &hole) { return hole.startsWith(path + QLatin1Char('/')); });
    }

    // QFile::symLinkTarget() would make a relative target absolute.
    static QString readLink(const QString &path)
    {
        QByteArray target(4096, '\0');
        const auto size = ::readlink(QFile::encodeName(path).constData(), target.data(),
                                     static_cast<size_t>(target.size()));
        return QFile::decodeName(target.left(static_cast<int>(std::max<ssize_t>(size, 0))));
    }

    QStringList m_holes;
    QStringList m_arguments;
};

QStringList holesOf(const View &view)
{
    QStringList holes = View::copies();
    holes << QStringLiteral("/dev") << QStringLiteral("/proc") << QStringLiteral("/run")
          << QStringLiteral("/tmp") << QStringLiteral("/etc/vesk") << QStringLiteral("/usr/share/vesk");
    for (const Bind &bind : view.binds()) {
        if (!QFileInfo::exists(bind.inside))
            holes.append(bind.inside);
    }
    return holes;
}

void addCopy(QStringList *arguments, const QString &from, const QString &inside)
{
    if (!View::canCopy(from)) {
        *arguments << QStringLiteral("--ro-bind") << from << inside;
        return;
    }
    const int file = ::open(QFile::encodeName(from).constData(), O_RDONLY); // stays open across exec
    if (file >= 0)
        *arguments << QStringLiteral("--perms") << QStringLiteral("0644") << QStringLiteral("--file")
                   << QString::number(file) << inside;
}

void addView(QStringList *arguments, const View &view)
{
    for (const Bind &bind : view.binds())
        *arguments << (bind.writable ? QStringLiteral("--bind") : QStringLiteral("--ro-bind")) << bind.host
                   << bind.inside;
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
    return kConfinement + QStringList{QStringLiteral("--ro-bind"), QStringLiteral("/"), QStringLiteral("/")} +
           kKernelFolders +
           QStringList{QStringLiteral("--tmpfs"), QStringLiteral("/tmp"), QStringLiteral("true")};
}

QStringList Bubblewrap::commandLine(const View &view, const RunFolder &folder, const QStringList &stage)
{
    QStringList arguments = kConfinement + Layout(holesOf(view)).arguments() + kKernelFolders;
    for (const QString &path : View::copies())
        addCopy(&arguments, folder.root() + path, path);
    addView(&arguments, view);
    for (const QString &path : view.readOnly())
        arguments << QStringLiteral("--remount-ro") << path;
    arguments << QStringLiteral("--remount-ro") << QStringLiteral("/");
    arguments << QStringLiteral("--chdir") << view.workingFolder();
    return QStringList{QStringLiteral("bwrap"), QStringLiteral("--args"),
                       QString::number(argumentFile(arguments)), QStringLiteral("--")} +
           stage;
}

} // namespace sandbox
