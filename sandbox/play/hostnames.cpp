// SPDX-License-Identifier: Apache-2.0
#include "play/hostnames.h"

#include "journal/error.h"
#include "journal/smallfile.h"
#include "world/world.h"

#include <QDir>
#include <QFile>

namespace sandbox {

namespace {

// A multicast address: no TCP connection leads there.
constexpr char kNoWay[] = "224.0.0.1 localhost uim.vesk.test\n";

// In the copies that stand among the scratch files of what runs.
void write(const StateDirectory &state, const QByteArray &content)
{
    const QDir scratch(state.run());
    bool isWritten = false;
    for (const QString &run : scratch.entryList({QStringLiteral("vesk-isolate-*")}, QDir::Dirs)) {
        QFile table(scratch.filePath(run + QStringLiteral("/hosts")));
        isWritten = (table.exists() && table.open(QIODevice::WriteOnly | QIODevice::Truncate) &&
                     table.write(content) == content.size() && table.flush()) ||
                    isWritten;
    }
    if (!isWritten)
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
    const QString table = world.state().inside(QStringLiteral("/etc/hosts"));
    write(world.state(), smallfile::read(table).value_or(QByteArray()));
}

} // namespace sandbox
