// SPDX-License-Identifier: Apache-2.0
#include "campaign/commands.h"

#include "campaign/report.h"
#include "campaign/rowrun.h"
#include "campaign/worlds.h"
#include "play/needs.h"
#include "scenario/json.h"
#include "world/tools.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QDir>
#include <QJsonDocument>
#include <QTemporaryDir>

#include <cstdio>

namespace sandbox {

namespace {

constexpr int kUsageError = 2;
constexpr int kSkipped = 77; // as ctest is told

int fail(const QString &reason, int exitCode = 1)
{
    std::fprintf(stderr, "vesk-sandbox: %s\n", qPrintable(reason));
    return exitCode;
}

void say(const QString &line)
{
    std::printf("%s\n", qPrintable(line));
}

// A word with its options and exactly one argument, or none where `argument` is empty. Wrong use ends the
// process, as --help does.
void parse(QCommandLineParser &parser, const QStringList &arguments, const char *argument)
{
    const int wanted = *argument == '\0' ? 0 : 1;
    parser.addHelpOption();
    if (wanted == 1)
        parser.addPositionalArgument(QLatin1String(argument), QString());
    parser.process(QStringList{arguments.at(0) + QLatin1Char(' ') + arguments.at(1)} + arguments.mid(2));
    if (parser.positionalArguments().size() != wanted) {
        std::fprintf(stderr, "%s", qPrintable(parser.helpText()));
        std::exit(kUsageError);
    }
}

// row: id or other name of the one that is wanted; empty: all.
std::optional<CampaignTables> tables(QString *error, const QString &row = {})
{
    return CampaignTables::load(CampaignTables::standardDirectory(), error, row);
}

// How the rows are told to ctest. Who includes it may set VESK_ROW_ENVIRONMENT.
QString testFile(const CampaignTables &tables, const QString &worlds)
{
    QString text = QStringLiteral(R"(function(campaign_test name)
  add_test("${name}" "%1" ${ARGN})
  set_tests_properties("${name}" PROPERTIES TIMEOUT 300 SKIP_RETURN_CODE 77 ENVIRONMENT "${VESK_ROW_ENVIRONMENT}")
endfunction()
function(campaign_row id label)
  campaign_test("campaign/${id}" run "${id}" --worlds "%2")
  set_tests_properties("campaign/${id}" PROPERTIES LABELS "campaign;${label}" FIXTURES_REQUIRED campaign_worlds)
endfunction()
campaign_test(campaign_worlds worlds "%2")
set_tests_properties(campaign_worlds PROPERTIES FIXTURES_SETUP campaign_worlds)
)")
                       .arg(QCoreApplication::applicationFilePath(), worlds);
    for (const Row &row : tables.rows())
        text += QStringLiteral("campaign_row(\"%1\" %2)\n")
                    .arg(row.id(), row.isFast ? QStringLiteral("fast") : QStringLiteral("full"));
    return text;
}

int runIn(const QString &state, const CampaignTables &tables, const Row &row, const QString &program)
{
    QString error;
    const QJsonObject start = json::object(row.scenario, "start");
    const int smallTmp = json::number(start, "small_tmp", 0);
    const QString tmp = StateFolder(state).inside(QStringLiteral("/tmp"));
    if (smallTmp > 0 && !needs::enterSmallTmp(tmp, smallTmp, &error))
        return fail(error);
    const QStringList complaints = RowRun(tables, row, state, program).run();
    for (const QString &complaint : complaints)
        say(complaint);
    return complaints.isEmpty() ? 0 : 1;
}

} // namespace

int listRows(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral("Lists the rows of the campaign."));
    parser.addOptions({{QStringLiteral("ctest"), QStringLiteral("As a test file for ctest.")},
                       {QStringLiteral("worlds"),
                        QStringLiteral("With --ctest: where the worlds lie that the rows start from."),
                        QStringLiteral("directory"), QStringLiteral("worlds")}});
    parse(parser, arguments, "");
    QString error;
    const auto all = tables(&error);
    if (!all)
        return fail(error);
    if (parser.isSet(QStringLiteral("ctest"))) {
        std::printf("%s",
                    qPrintable(testFile(*all, QDir(parser.value(QStringLiteral("worlds"))).absolutePath())));
        return 0;
    }
    for (const Row &row : all->rows())
        say(QStringLiteral("%1  %2").arg(row.id(), json::text(row.scenario, "title")));
    const auto names = all->otherNames();
    for (auto name = names.begin(); name != names.end(); ++name)
        say(QStringLiteral("%1  is %2").arg(name.key(), *name));
    return 0;
}

int showRow(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(
        QStringLiteral("Prints the situation that a row makes of the world and what must be seen."));
    parse(parser, arguments, "ROW");
    QString error;
    const QString name = parser.positionalArguments().constFirst();
    const auto all = tables(&error, name);
    if (!all)
        return fail(error);
    const Row *row = all->row(name);
    if (row == nullptr)
        return fail(QStringLiteral("no row \"%1\"; \"vesk-sandbox rows\" lists them").arg(name));
    QJsonObject shown = row->scenario;
    if (!row->note.isEmpty())
        shown.insert(QStringLiteral("note"), row->note);
    std::printf("%s", QJsonDocument(shown).toJson().constData());
    return 0;
}

int makeWorlds(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(
        QStringLiteral("Makes the two worlds that rows start from: a new one, and one that has joined."));
    parse(parser, arguments, "DIRECTORY");
    QDir directory(parser.positionalArguments().constFirst());
    QString error;
    if (!directory.removeRecursively() || !directory.mkpath(QStringLiteral(".")))
        error = QStringLiteral("cannot make the directory %1").arg(directory.path());
    const bool isMade = error.isEmpty() &&
                        worlds::makeNew(directory.absoluteFilePath(QStringLiteral("join")), &error) &&
                        worlds::makeJoined(directory.absoluteFilePath(QStringLiteral("leave")), &error);
    return isMade ? 0 : fail(error);
}

int runRow(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Runs the program through a row of the campaign and compares what is seen with what must be."));
    parser.addOptions(
        {{QStringLiteral("worlds"), QStringLiteral("Where \"vesk-sandbox worlds\" made them."),
          QStringLiteral("directory")},
         {QStringLiteral("program"), QStringLiteral("What is started in veskw's place."),
          QStringLiteral("path")},
         {QStringLiteral("keep"), QStringLiteral("Keep the world of a row that passes, too.")}});
    parse(parser, arguments, "ROW");
    QString error;
    const QString name = parser.positionalArguments().constFirst();
    const auto all = tables(&error, name);
    const Row *row = all ? all->row(name) : nullptr;
    if (row == nullptr)
        return fail(all ? QStringLiteral("no row \"%1\"").arg(name) : error, kUsageError);
    const QString lack = needs::lacking(json::texts(row->scenario, "needs"));
    if (!lack.isEmpty()) {
        say(lack);
        return kSkipped;
    }
    QTemporaryDir directory(QDir::tempPath() + QStringLiteral("/vesk-row-XXXXXX"));
    const QString state = directory.filePath(QStringLiteral("world"));
    const QString journey = json::text(row->scenario, "journey");
    const bool isMade =
        parser.isSet(QStringLiteral("worlds"))
            ? worlds::copy(QDir(parser.value(QStringLiteral("worlds"))).absoluteFilePath(journey), state,
                           &error)
        : journey == QLatin1String("leave") ? worlds::makeJoined(state, &error)
                                            : worlds::makeNew(state, &error);
    const QString program = parser.isSet(QStringLiteral("program"))
                                ? QFileInfo(parser.value(QStringLiteral("program"))).absoluteFilePath()
                                : findTool(QStringLiteral("veskw"), &error);
    if (!isMade || program.isEmpty())
        return fail(error);
    const int exitCode = runIn(state, *all, *row, program);
    directory.setAutoRemove(exitCode == 0 && !parser.isSet(QStringLiteral("keep")));
    if (!directory.autoRemove())
        say(QStringLiteral("left in %1").arg(state));
    return exitCode;
}

int reportRows(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(
        QStringLiteral("Prints what ctest has seen of the rows, from the results that it wrote as JUnit."));
    parser.addOption({QStringLiteral("skipped"), QStringLiteral("Only what was skipped, and why.")});
    parse(parser, arguments, "FILE");
    QString error;
    const auto all = tables(&error);
    const auto results =
        all ? TestResults::read(parser.positionalArguments().constFirst(), &error) : std::nullopt;
    if (!results)
        return fail(error);
    std::printf("%s", qPrintable(parser.isSet(QStringLiteral("skipped")) ? results->skippedText()
                                                                         : Report(*all, *results).text()));
    return 0;
}

} // namespace sandbox
