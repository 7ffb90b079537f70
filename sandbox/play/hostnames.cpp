// SPDX-License-Identifier: Apache-2.0
#include "play/hostnames.h"

#include "journal/error.h"
#include "journal/smallfile.h"
#include "play/processtable.h"
#include "world/world.h"

#include <QDir>
#include <QFile>

#include <sys/stat.h>

namespace sandbox {

namespace {

constexpr char kTable[] = "/etc/hosts";

// A multicast address: no TCP connection leads there.
constexpr char kNoWay[] = "224.0.0.1 localhost uim.vesk.test\n";

bool isMachinesOwn(const QString &path)
{
    struct stat ours = {};
    struct stat theirs = {};
    return ::stat(kTable, &ours) != 0 || ::stat(QFile::encodeName(path).constData(), &theirs) != 0 ||
           (ours.st_dev == theirs.st_dev && ours.st_ino == theirs.st_ino);
}

// In its own namespace, or among the scratch files of the run.
QString tableOfProgram(const StateDirectory &state)
{
    QString inside =
        QStringLiteral("/proc/%1/root%2").arg(descendantNamed("veskw")).arg(QLatin1String(kTable));
    if (!isMachinesOwn(inside))
        return inside;
    const QDir scratch(state.run());
    for (const QString &run : scratch.entryList({QStringLiteral("vesk-isolate-*")}, QDir::Dirs)) {
        QString copy = scratch.filePath(run + QStringLiteral("/copy-etc-hosts"));
        if (QFile::exists(copy))
            return copy;
    }
    return {};
}

void write(const StateDirectory &state, const QByteArray &content)
{
    const QString path = tableOfProgram(state);
    QFile file(path);
    if (path.isEmpty() || !file.open(QIODevice::WriteOnly | QIODevice::Truncate) ||
        file.write(content) != content.size() || !file.flush())
        throw Error(QStringLiteral("the program has no table of hosts that can be written"));
}

} // namespace

void hostnames::loseRoute(World &world)
{
    write(world.state(), kNoWay);
}

void hostnames::forget(World &world)
{
    write(world.state(), "127.0.0.1 terminal-01\n");
}

void hostnames::restore(World &world)
{
    const QString table = world.state().inside(QLatin1String(kTable));
    write(world.state(), smallfile::read(table).value_or(QByteArray()));
}

} // namespace sandbox
