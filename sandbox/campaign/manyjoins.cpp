// SPDX-License-Identifier: Apache-2.0
#include "campaign/manyjoins.h"

#include "campaign/processtable.h"
#include "campaign/worldchecks.h"
#include "isolation/guard.h"
#include "world/child.h"
#include "world/tools.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QThread>

#include <sys/stat.h>
#include <sys/wait.h>

namespace sandbox {

namespace {

constexpr int kJoinLimitMs = 120000;
constexpr int kEndLimitMs = 3000;
constexpr unsigned long kPauseMs = 20;

bool isSocket(const QString &path)
{
    struct stat status = {};
    return ::lstat(QFile::encodeName(path).constData(), &status) == 0 && S_ISSOCK(status.st_mode);
}

// What lost its starter came to us. What is about to end gets the time to do so.
QString leftProcess()
{
    const QDeadlineTimer limit(kEndLimitMs);
    for (;;) {
        while (::waitpid(-1, nullptr, WNOHANG) > 0) {
            // until none has ended
        }
        const QVector<ProcessEntry> left = descendants();
        if (left.isEmpty())
            return {};
        if (limit.hasExpired())
            return QString::fromUtf8(left.first().name);
        QThread::msleep(kPauseMs);
    }
}

} // namespace

ManyJoins::ManyJoins(const CampaignTables &tables, const Row &row, QString state)
    : m_tables(tables)
    , m_row(row)
    , m_state(std::move(state))
{
}

QStringList ManyJoins::run()
{
    m_before = viewFiles(StateFolder(m_state)); // as new as those that come
    for (ViewEntry &entry : m_before)
        entry.content.clear();
    adoptOrphans(); // so that a process that is left over comes to us
    const int joins = m_row.start.value(QLatin1String("joins")).toInt();
    for (int number = 1; number <= joins; ++number) {
        const QStringList complaints = joinOnce(number);
        if (!complaints.isEmpty())
            return QStringList{QStringLiteral("join %1 of %2").arg(number).arg(joins)} + complaints;
    }
    return {};
}

QStringList ManyJoins::joinOnce(int number)
{
    const QString world = m_state + QStringLiteral("/world-%1").arg(number);
    const QString scratch = m_state + QStringLiteral("/scratch");
    QDir().mkpath(scratch);
    QString error;
    Child join(m_state + QStringLiteral("/joins.log"));
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("TMPDIR"), scratch);
    join.setProcessEnvironment(environment);
    join.start(findTool(QStringLiteral("vesk-sandbox"), &error),
               {QStringLiteral("--state"), world, QStringLiteral("--headless"), QStringLiteral("--autopilot"),
                QStringLiteral("join")});
    if (!join.waitForFinished(kJoinLimitMs))
        return {QStringLiteral("it does not end in time")};
    QStringList complaints;
    if (join.exitCode() != 0)
        complaints.append(QString::fromUtf8(join.readAllStandardOutput().trimmed().split('\n').last()));
    complaints += worldchecks::files(StateFolder(world), m_before, m_tables, m_row.expect.files);
    const QString left = leftovers(world, scratch);
    if (!left.isEmpty())
        complaints.append(left);
    if (complaints.isEmpty())
        QDir(world).removeRecursively();
    return complaints;
}

QString ManyJoins::leftovers(const QString &world, const QString &scratch) const
{
    const QString process = leftProcess();
    if (!process.isEmpty())
        return QStringLiteral("left over: process %1").arg(process);
    const QStringList names =
        QDir(scratch).entryList(QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot);
    if (!names.isEmpty())
        return QStringLiteral("left over: %1 in the folder for temporary files").arg(names.first());
    QDirIterator files(world, QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot,
                       QDirIterator::Subdirectories);
    while (files.hasNext()) {
        const QString path = files.next();
        if (isSocket(path))
            return QStringLiteral("left over: socket %1").arg(path);
    }
    return {};
}

} // namespace sandbox
