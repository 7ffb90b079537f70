// SPDX-License-Identifier: Apache-2.0
#include "campaign/commands.h"

#include "campaign/rowrun.h"
#include "campaign/worlds.h"
#include "data/data.h"
#include "journal/commandline.h"
#include "journal/error.h"
#include "play/needs.h"
#include "scenario/json.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QDir>
#include <QJsonDocument>
#include <QTemporaryDir>

#include <cstdio>

namespace sandbox {

namespace {

using commandline::say;

constexpr int kUsageError = 2;
constexpr int kSkipped = 77; // as ctest is told

// A word with its options and exactly one argument, or none where `argument` is empty. A usage error ends the
// process, as --help does.
void parse(QCommandLineParser &parser, const QStringList &arguments, const char *argument,
           const char *description, std::initializer_list<commandline::Option> options = {})
{
    const int wanted = *argument == '\0' ? 0 : 1;
    if (wanted == 1)
        parser.addPositionalArgument(QLatin1String(argument), QString());
    const QString error = commandline::parse(
        parser, QStringList{arguments.at(0) + QLatin1Char(' ') + arguments.at(1)} + arguments.mid(2),
        description, options);
    if (!error.isEmpty() || parser.positionalArguments().size() != wanted) {
        std::exit(commandline::fail(error + QLatin1Char('\n') + parser.helpText(), kUsageError));
    }
}

// How the rows are told to ctest. The including file may set VESK_ROW_ENVIRONMENT.
QString testFile(const Rows &rows, const QString &worlds)
{
    QString text =
        QString::fromUtf8(data::read("rows.cmake")).arg(QCoreApplication::applicationFilePath(), worlds);
    for (const Row &row : rows.all())
        text += QStringLiteral("campaign_row(\"%1\" %2)\n")
                    .arg(row.id, row.isFast ? QStringLiteral("fast") : QStringLiteral("full"));
    return text;
}

Row found(const Rows &rows, const QCommandLineParser &parser)
{
    const QString name = parser.positionalArguments().constFirst();
    const auto row = rows.find(name);
    if (!row)
        throw Error(QStringLiteral("no row \"%1\"; \"vesk-sandbox rows\" lists them").arg(name));
    return *row;
}

int runIn(const QString &state, const Rows &rows, const Row &row, const QString &program)
{
    const QStringList complaints = RowRun(rows, row, state, program).run();
    for (const QString &complaint : complaints)
        say(complaint);
    return complaints.isEmpty() ? 0 : 1;
}

} // namespace

int listRows(const QStringList &arguments)
{
    QCommandLineParser parser;
    parse(
        parser, arguments, "", "Lists the rows of the campaign.",
        {{"ctest", "As a test file for ctest."},
         {"worlds", "With --ctest: where the worlds lie that the rows start from.", "directory", "worlds"}});
    const Rows all = Rows::load();
    if (parser.isSet(QStringLiteral("ctest"))) {
        std::printf("%s",
                    qPrintable(testFile(all, QDir(parser.value(QStringLiteral("worlds"))).absolutePath())));
        return 0;
    }
    for (const Row &row : all.all())
        say(QStringLiteral("%1  %2").arg(row.id, json::text(row.scenario, "title")));
    const auto names = all.otherNames();
    for (auto name = names.begin(); name != names.end(); ++name)
        say(QStringLiteral("%1  is %2").arg(name.key(), name.value().toString()));
    return 0;
}

int showRow(const QStringList &arguments)
{
    QCommandLineParser parser;
    parse(parser, arguments, "ROW",
          "Prints the situation that a row makes of the world and what must be seen.");
    const Row row = found(Rows::load(), parser);
    QJsonObject shown = row.scenario;
    if (!row.note.isEmpty())
        shown.insert(QStringLiteral("note"), row.note);
    std::printf("%s", QJsonDocument(shown).toJson().constData());
    return 0;
}

int makeWorlds(const QStringList &arguments)
{
    QCommandLineParser parser;
    parse(parser, arguments, "DIRECTORY",
          "Makes the two worlds that rows start from: a new one, and one that has joined.");
    const QDir directory(parser.positionalArguments().constFirst());
    if (!directory.mkpath(QStringLiteral(".")))
        throw Error(QStringLiteral("cannot create the directory %1").arg(directory.path()));
    for (const QString &name : {QStringLiteral("join"), QStringLiteral("leave")})
        worlds::make(name, directory.absoluteFilePath(name));
    return 0;
}

int runRow(const QStringList &arguments)
{
    QCommandLineParser parser;
    parse(parser, arguments, "ROW",
          "Runs the program through a row of the campaign and compares what is seen with what must be.",
          {{"worlds", "Where \"vesk-sandbox worlds\" made them.", "directory"},
           {"rows", "Output of make-rows in place of this installation's.", "file"},
           {"program", "What is started in veskw's place.", "path"},
           {"state", "A world for this row alone, in place of a copy.", "directory"},
           {"keep", "Keep the world of a row that passes, too."}});
    const Rows all = Rows::load(parser.value(QStringLiteral("rows")));
    const Row row = found(all, parser);
    const QString lack = needs::lacking(json::texts(row.scenario, "needs"));
    if (!lack.isEmpty()) {
        say(lack);
        return kSkipped;
    }
    const QString program = parser.isSet(QStringLiteral("program"))
                                ? QFileInfo(parser.value(QStringLiteral("program"))).absoluteFilePath()
                                : findTool(QStringLiteral("veskw"));
    if (parser.isSet(QStringLiteral("state")))
        return runIn(parser.value(QStringLiteral("state")), all, row, program);

    QTemporaryDir directory(QDir::tempPath() + QStringLiteral("/vesk-row-XXXXXX"));
    const QString state = directory.filePath(QStringLiteral("world"));
    const QString name = worlds::nameFor(json::text(row.scenario, "journey"));
    if (parser.isSet(QStringLiteral("worlds")))
        worlds::copy(QDir(parser.value(QStringLiteral("worlds"))).absoluteFilePath(name), state);
    else
        worlds::make(name, state);
    const int smallTmp = json::number(json::object(row.scenario, "start"), "small_tmp", 0);
    const int exitCode =
        smallTmp == 0
            ? runIn(state, all, row, program)
            : needs::runInSmallTmp(
                  StateDirectory(state).inside(QStringLiteral("/tmp")), smallTmp,
                  QStringList{QStringLiteral("run")} + parser.positionalArguments() +
                      QStringList{QStringLiteral("--program"), program, QStringLiteral("--rows"),
                                  parser.value(QStringLiteral("rows")), QStringLiteral("--state"), state});
    directory.setAutoRemove(exitCode == 0 && !parser.isSet(QStringLiteral("keep")));
    if (!directory.autoRemove())
        say(QStringLiteral("left in %1").arg(state));
    return exitCode;
}

} // namespace sandbox
