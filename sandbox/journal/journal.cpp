// SPDX-License-Identifier: Apache-2.0
#include "journal/journal.h"

#include "journal/programlog.h"

#include <QDateTime>
#include <QFile>
#include <QMap>
#include <QtDebug>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <unistd.h>

namespace sandbox {

namespace {

constexpr int kSourceWidth = 9;

bool breaksTheLine(QChar character)
{
    const auto category = character.category();
    return category == QChar::Other_Control || category == QChar::Separator_Line ||
           category == QChar::Separator_Paragraph;
}

QByteArray lineOf(const QString &source, const QString &text)
{
    const QString now = QDateTime::currentDateTime().toString(QStringLiteral("yyyy-MM-dd hh:mm:ss.zzz"));
    const QString line = now + QLatin1Char(' ') + source.leftJustified(kSourceWidth) + QLatin1Char(' ') +
                         onOneLine(text) + QLatin1Char('\n');
    return line.toUtf8();
}

bool append(const QString &path, const QByteArray &line)
{
    const int file =
        ::open(QFile::encodeName(path).constData(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0644);
    if (file < 0)
        return false;
    const ssize_t written =
        TEMP_FAILURE_RETRY(::write(file, line.constData(), static_cast<size_t>(line.size())));
    const int reason = errno;
    ::close(file);
    errno = reason;
    return written == line.size();
}

} // namespace

QString onOneLine(const QString &text)
{
    static const QMap<QChar, QString> named{{QLatin1Char('\n'), QStringLiteral("\\n")},
                                            {QLatin1Char('\r'), QStringLiteral("\\r")},
                                            {QLatin1Char('\t'), QStringLiteral("\\t")}};
    QString line;
    for (const QChar each : text)
        line += !breaksTheLine(each)
                    ? QString(each)
                    : named.value(each, QStringLiteral("\\x%1").arg(each.unicode(), 2, 16, QLatin1Char('0')));
    return line;
}

Journal::Journal(QString path)
    : m_path(std::move(path))
{
}

void Journal::write(const QString &source, const QString &text) const
{
    ProgramLog program(m_path);
    bool good = true;
    for (const ProgramEvent &event : program.takeEvents())
        good = append(m_path, lineOf(event.source, event.text)) && good;
    if (!append(m_path, lineOf(source, text)) || !good)
        qWarning("cannot write to the journal %s: %s", qUtf8Printable(m_path), std::strerror(errno));
}

} // namespace sandbox
