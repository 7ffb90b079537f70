// SPDX-License-Identifier: Apache-2.0
#include "campaign/worldchecks.h"

#include <QDirIterator>
#include <QFile>
#include <QFileInfo>
#include <QJsonDocument>
#include <QJsonObject>

#include <sys/stat.h>

namespace sandbox {

namespace {

const char *const kFolders[] = {"/tmp/vesk", "/etc/vesk"};

QByteArray contentOf(const QString &path)
{
    QFile file(path);
    if (!QFileInfo(path).isFile())
        return {};
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

QString recordIn(const QByteArray &content)
{
    const QJsonValue joined = QJsonDocument::fromJson(content).object().value(QLatin1String("is_Domain"));
    if (!joined.isBool())
        return QStringLiteral("no record");
    return joined.toBool() ? QStringLiteral("record true") : QStringLiteral("record false");
}

// What a file holds, in the words of the tables.
QString kindOf(const StateFolder &state, const QString &path)
{
    const QByteArray content = contentOf(path);
    if (content.isEmpty())
        return QStringLiteral("empty");
    if (path.endsWith(QLatin1String("userinfo.json")))
        return recordIn(content);
    if (content == contentOf(state.at("server/ca.crt")))
        return QStringLiteral("ca");
    if (content.contains("PRIVATE KEY-----"))
        return QStringLiteral("key");
    return content.contains("BEGIN CERTIFICATE") ? QStringLiteral("certificate") : QStringLiteral("other");
}

QString modeOf(const QString &path)
{
    struct stat status = {};
    if (::lstat(QFile::encodeName(path).constData(), &status) != 0)
        return QStringLiteral("absent");
    if (S_ISLNK(status.st_mode))
        return QStringLiteral("link");
    return QStringLiteral("0%1").arg(status.st_mode & 07777, 3, 8, QLatin1Char('0'));
}

QString difference(const StateFolder &state, const QString &path, const QString &expected)
{
    const QString inside = state.inside(path);
    const QString mode = modeOf(inside);
    const QString seen =
        mode == QLatin1String("absent") ? mode : mode + QLatin1Char(' ') + kindOf(state, inside);
    const QString wantedMode = expected.section(QLatin1Char(' '), 0, 0);
    const QString wantedKind = expected.section(QLatin1Char(' '), 1);
    const bool modeFits =
        wantedMode == mode || (wantedMode == QLatin1String("*") && mode != QLatin1String("absent"));
    const bool kindFits = wantedKind == QLatin1String("any") || seen == mode + QLatin1Char(' ') + wantedKind;
    return modeFits && kindFits ? QString()
                                : QStringLiteral("%1: expected %2, seen %3").arg(path, expected, seen);
}

QStringList filesOf(const StateFolder &state)
{
    QStringList result;
    for (const char *folder : kFolders) {
        const QString path = QLatin1String(folder);
        QDirIterator files(state.inside(path),
                           QDir::Files | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot,
                           QDirIterator::Subdirectories);
        while (files.hasNext())
            result.append(path + QLatin1Char('/') + QDir(state.inside(path)).relativeFilePath(files.next()));
    }
    return result;
}

} // namespace

QStringList worldchecks::calls(const JourneyPlan &plan, const QMap<QString, int> &expected,
                               const QByteArray &journal)
{
    QMap<QString, int> byLine; // two calls may look alike
    QMap<QString, QStringList> names;
    for (const Call &call : plan.calls) {
        byLine[call.line] += expected.value(call.name);
        names[call.line].append(call.name);
    }
    QStringList result;
    for (auto line = byLine.begin(); line != byLine.end(); ++line) {
        const int seen = journal.count(line.key().toUtf8());
        if (seen != *line)
            result.append(QStringLiteral("call %1: expected %2 times, seen %3 times")
                              .arg(names.value(line.key()).join(QLatin1Char('/')))
                              .arg(*line)
                              .arg(seen));
    }
    return result;
}

QStringList worldchecks::files(const StateFolder &state, const QMap<QString, QString> &expected)
{
    QStringList result;
    for (auto file = expected.begin(); file != expected.end(); ++file) {
        const QString complaint = difference(state, file.key(), *file);
        if (!complaint.isEmpty())
            result.append(complaint);
    }
    const QStringList present = filesOf(state);
    for (const QString &path : present) {
        if (!expected.contains(path))
            result.append(QStringLiteral("%1: expected absent, seen %2 %3")
                              .arg(path, modeOf(state.inside(path)), kindOf(state, state.inside(path))));
    }
    return result;
}

QStringList worldchecks::journal(const QByteArray &journal, const QStringList &expected)
{
    QStringList result;
    for (const QString &part : expected) {
        if (!journal.contains(part.toUtf8()))
            result.append(QStringLiteral("journal: expected \"%1\", not seen").arg(part));
    }
    return result;
}

QStringList worldchecks::log(const StateFolder &state, const QStringList &expected)
{
    const QByteArray text = contentOf(state.programLog());
    QStringList result;
    for (const QString &part : expected) {
        if (!text.contains(part.toUtf8()))
            result.append(QStringLiteral("program log: expected \"%1\", not seen").arg(part));
    }
    return result;
}

} // namespace sandbox
