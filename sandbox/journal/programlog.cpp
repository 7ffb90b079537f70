// SPDX-License-Identifier: Apache-2.0
#include "journal/programlog.h"

#include "journal/smallfile.h"

#include <QFileInfo>
#include <QRegularExpression>

#include <sys/file.h>

namespace sandbox {

namespace {

constexpr char kStaged[] = "/tmp/vesk/userinfo.json";

// The journal has a time of its own.
QString withoutProcessAndTime(const QString &line)
{
    static const QRegularExpression prefix(QStringLiteral("^\\[\\d+\\]: [\\d-]+ [\\d:.]+ "));
    return QString(line).remove(prefix).trimmed();
}

} // namespace

ProgramLog::ProgramLog(const QString &journalPath)
    : m_directory(QFileInfo(journalPath).absolutePath())
    , m_position(m_directory + QStringLiteral("/program.position"))
{
    if (QFileInfo::exists(m_directory + QStringLiteral("/program.log")) &&
        m_position.open(QIODevice::ReadWrite))
        ::flock(m_position.handle(), LOCK_EX);
}

std::vector<ProgramEvent> ProgramLog::takeEvents()
{
    std::vector<ProgramEvent> events;
    for (const QByteArray &line : takeNewLines().split('\n')) {
        if (line.trimmed().isEmpty())
            continue;
        events.push_back({QStringLiteral("program"), withoutProcessAndTime(QString::fromUtf8(line))});
        if (line.contains("write json success"))
            events.push_back({QStringLiteral("file"), stagedRecord()});
    }
    return events;
}

QByteArray ProgramLog::takeNewLines()
{
    QFile log(m_directory + QStringLiteral("/program.log"));
    if (!m_position.isOpen() || !log.open(QIODevice::ReadOnly))
        return QByteArray();
    const qint64 taken = m_position.readAll().toLongLong();
    if (taken > log.size() || !log.seek(taken))
        return QByteArray();
    QByteArray lines = log.readAll();
    lines.truncate(lines.lastIndexOf('\n') + 1);
    if (!lines.isEmpty()) {
        m_position.resize(0);
        m_position.seek(0);
        m_position.write(QByteArray::number(taken + lines.size()));
        m_position.flush();
    }
    return lines;
}

QString ProgramLog::stagedRecord() const
{
    const QJsonObject record =
        smallfile::readObject(m_directory + QStringLiteral("/root") + QLatin1String(kStaged));
    const bool joined = record.value(QLatin1String("is_Domain")).toBool();
    if (record.isEmpty())
        return QStringLiteral("staged %1 cannot be read").arg(QLatin1String(kStaged));
    return QStringLiteral("staged %1 with \"is_Domain\" %2")
        .arg(QLatin1String(kStaged), joined ? QStringLiteral("true") : QStringLiteral("false"));
}

} // namespace sandbox
