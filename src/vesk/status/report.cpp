// SPDX-License-Identifier: Apache-2.0
#include "report.h"

#include "command.h"
#include "logtext.h"

#include <QDateTime>
#include <QFile>
#include <QRegularExpression>

#include <sys/stat.h>

namespace {

constexpr char kMaxJournalLines[] = "2000";

struct Section
{
    const char *title;
    const char *program;
    QStringList arguments;
};

QVector<Section> sections()
{
    return {
        {"Files", "ls", {QStringLiteral("-lab"), QStringLiteral("/etc/vesk"), QStringLiteral("/tmp/vesk")}},
        {"Packages",
         "dpkg-query",
         {QStringLiteral("-W"), QStringLiteral("vesk*"), QStringLiteral("libmtk0"),
          QStringLiteral("libhttpclientapi0"), QStringLiteral("liblibvesk-mde0")}},
        {"Journal",
         "journalctl",
         {QStringLiteral("-q"), QStringLiteral("--no-pager"), QStringLiteral("-n"),
          QLatin1String(kMaxJournalLines), QStringLiteral("_EXE=/usr/bin/veskw"),
          QStringLiteral("_EXE=/usr/bin/vesk-status"), QStringLiteral("+"),
          QStringLiteral("_SYSTEMD_UNIT=vesk-status-expiry.service")}},
    };
}

const QString kRemoved = QStringLiteral("[removed]");
const QString kTitleMark = QStringLiteral("==");

// Whole PEM keys, over all their lines. One that does not end goes on to the end of the section.
void removeKeys(QString &text)
{
    static const QRegularExpression begin(QStringLiteral("-----BEGIN [A-Z ]*KEY-----"));
    static const QRegularExpression end(QStringLiteral("-----END [A-Z ]*KEY-----"));
    for (int from = text.indexOf(begin); from >= 0; from = text.indexOf(begin, from)) {
        QRegularExpressionMatch match;
        const int last = text.indexOf(end, from, &match) < 0 ? text.size() : match.capturedEnd();
        text.replace(from, last - from, kRemoved);
    }
}

void removeSecrets(QString &line)
{
    static const QRegularExpression base64(QStringLiteral("[A-Za-z0-9+/]{60,}=*"));
    // A value of JSON, which may stand in a string of JSON itself.
    static const QRegularExpression quoted(
        QStringLiteral(R"re((\\*"[^"]*(?:passw|pwd|secret|token|key)[^"]*"\s*:\s*)(\\*)".*?(?<!\\)\2")re"),
        QRegularExpression::CaseInsensitiveOption);
    static const QRegularExpression assigned(
        QStringLiteral(R"re(((?:password|passwd|pwd|secret|token)\s*[=:]\s*)[^\s"&,;]+)re"),
        QRegularExpression::CaseInsensitiveOption);
    static const QRegularExpression userInfo(QStringLiteral("//[^\\s/@]*@"));
    line.replace(base64, kRemoved);
    line.replace(quoted, QStringLiteral("\\1\"%1\"").arg(kRemoved));
    line.replace(assigned, QStringLiteral("\\1") + kRemoved);
    line.replace(userInfo, QStringLiteral("//%1@").arg(kRemoved));
}

// A section without secrets, and without what steers a terminal. None of its lines looks like a title.
QString section(const QString &title, QString text)
{
    removeKeys(text);
    QStringList lines = text.split(QLatin1Char('\n'));
    for (QString &line : lines) {
        line = vesk::base::logText(line);
        removeSecrets(line);
        if (line.startsWith(kTitleMark))
            line.prepend(QLatin1Char(' '));
    }
    return QStringLiteral("\n%1 %2\n%3").arg(kTitleMark, title, lines.join(QLatin1Char('\n')));
}

QByteArray content(const QByteArray &status)
{
    QString text = QStringLiteral("vesk-status %1, %2\n")
                       .arg(QStringLiteral(VESK_VERSION), QDateTime::currentDateTime().toString(Qt::ISODate));
    text += section(QStringLiteral("Status"), QString::fromUtf8(status));
    for (const Section &part : sections()) {
        const QString program = QLatin1String(part.program);
        text +=
            section(QLatin1String(part.title),
                    outputOf(program, part.arguments).value_or(program + QStringLiteral(" cannot be run\n")));
    }
    return text.toUtf8();
}

} // namespace

bool writeReport(const QString &path, const QByteArray &status, QString *error)
{
    ::umask(S_IRWXG | S_IRWXO);
    QFile file(path);
    const bool isNew = file.open(QIODevice::WriteOnly | QIODevice::NewOnly);
    const QByteArray text = isNew ? content(status) : QByteArray();
    const bool isWritten = isNew && file.write(text) == text.size() && file.flush();
    if (isWritten)
        return true;
    *error = file.errorString();
    if (isNew)
        QFile::remove(path); // what is there would be taken for a report
    return false;
}
