// SPDX-License-Identifier: Apache-2.0
#include "play/processtable.h"

#include "journal/smallfile.h"

#include <QDir>
#include <QHash>

#include <unistd.h>

namespace sandbox {

namespace {

QByteArray contentOf(pid_t process, const char *file)
{
    return smallfile::read(QStringLiteral("/proc/%1/%2").arg(process).arg(QLatin1String(file)))
        .value_or(QByteArray());
}

// "7 (name with (brackets)) S 1 ..."
ProcessEntry entryOf(pid_t process)
{
    const QByteArray text = contentOf(process, "stat");
    const int begin = text.indexOf('(');
    const int end = text.lastIndexOf(')');
    if (begin < 0 || end < begin)
        return {};
    return {process, text.mid(end + 2).split(' ').value(1).toInt(), text.mid(begin + 1, end - begin - 1)};
}

} // namespace

QVector<ProcessEntry> descendants()
{
    QVector<ProcessEntry> all;
    const QStringList names = QDir(QStringLiteral("/proc")).entryList(QDir::Dirs);
    for (const QString &name : names) {
        if (const pid_t process = name.toInt())
            all.append(entryOf(process));
    }
    QHash<pid_t, pid_t> parents;
    for (const ProcessEntry &each : all)
        parents.insert(each.id, each.parent);
    QVector<ProcessEntry> ours;
    for (const ProcessEntry &each : all) {
        pid_t above = each.parent;
        while (above > 1 && above != ::getpid())
            above = parents.value(above);
        if (above == ::getpid())
            ours.append(each);
    }
    return ours;
}

QByteArray argumentsOf(pid_t process)
{
    return contentOf(process, "cmdline");
}

QByteArray environmentOf(pid_t process)
{
    return contentOf(process, "environ");
}

pid_t descendantNamed(const QByteArray &name)
{
    pid_t latest = 0;
    for (const ProcessEntry &each : descendants()) {
        if (each.name == name && each.id > latest && entryOf(each.parent).name != name)
            latest = each.id;
    }
    return latest;
}

} // namespace sandbox
