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
        {"Files", "ls", {QStringLiteral("-la"), QStringLiteral("/etc/vesk"), QStringLiteral("/tmp/vesk")}},
        {"Packages",
         "dpkg-query",
         {QStringLiteral("-W"), QStringLiteral("vesk*"), QStringLiteral("libmtk0"),
          QStringLiteral("libhttpclientapi0"), QStringLiteral("liblibvesk-mde0")}},
        {"Journal",
         "journalctl",
         {QStringLiteral("-q"), QStringLiteral("--no-pager"), QStringLiteral("-n"),
          QLatin1String(kMaxJournalLines), QStringLiteral("_COMM=veskw")}},
    };
}

QString harmless(const QString &text)
{
    QStringList lines = text.split(QLatin1Char('\n'));
    for (QString &line : lines)
        line = vesk::base::logText(line);
    return lines.join(QLatin1Char('\n'));
}

QString content(const QByteArray &status)
{
    QString text = QStringLiteral("vesk-status %1, %2\n\n== Status\n%3")
                       .arg(QStringLiteral(VESK_VERSION), QDateTime::currentDateTime().toString(Qt::ISODate),
                            QString::fromUtf8(status));
    for (const Section &section : sections()) {
        const QString program = QLatin1String(section.program);
        text += QStringLiteral("\n== %1\n%2")
                    .arg(QLatin1String(section.title),
                         outputOf(program, section.arguments)
                             .value_or(program + QStringLiteral(" cannot be run\n")));
    }
    return text;
}

} // namespace

QString redacted(QString text)
{
    static const QString removed = QStringLiteral("[removed]");
    static const QRegularExpression key(
        QStringLiteral("-----BEGIN [A-Z ]*KEY-----.*?(-----END [A-Z ]*KEY-----|\\z)"),
        QRegularExpression::DotMatchesEverythingOption);
    static const QRegularExpression base64(QStringLiteral("[A-Za-z0-9+/]{60,}=*"));
    static const QRegularExpression quoted(
        QStringLiteral(R"re((\\*"[^"]*(?:passw|pwd|secret|token|key)[^"]*"\s*:\s*)(\\*)".*?(?<!\\)\2")re"),
        QRegularExpression::CaseInsensitiveOption);
    static const QRegularExpression assigned(
        QStringLiteral(R"re(((?:password|passwd|pwd|secret|token)\s*[=:]\s*)[^\s"&,;]+)re"),
        QRegularExpression::CaseInsensitiveOption);
    static const QRegularExpression userInfo(QStringLiteral("//[^\\s/@]*@"));
    text.replace(key, removed);
    text.replace(base64, removed);
    text.replace(quoted, QStringLiteral("\\1\"") + removed + QLatin1Char('"'));
    text.replace(assigned, QStringLiteral("\\1") + removed);
    return text.replace(userInfo, QStringLiteral("//") + removed + QLatin1Char('@'));
}

bool writeReport(const QString &path, const QByteArray &status, QString *error)
{
    ::umask(S_IRWXG | S_IRWXO);
    QFile file(path);
    const bool isNew = file.open(QIODevice::WriteOnly | QIODevice::NewOnly);
    const QByteArray text = isNew ? redacted(harmless(content(status))).toUtf8() : QByteArray();
    const bool isWritten = isNew && file.write(text) == text.size() && file.flush();
    if (!isWritten)
        *error = file.errorString();
    return isWritten;
}
