// SPDX-License-Identifier: Apache-2.0
#include "campaign/campaignoptions.h"

#include <QCommandLineParser>
#include <QFileInfo>

namespace sandbox {

namespace {

constexpr int kMostJobs = 64;

QList<QCommandLineOption> knownOptions()
{
    const auto option = [](const char *name, const char *text, const char *value) {
        return QCommandLineOption(QLatin1String(name), QLatin1String(text), QLatin1String(value));
    };
    return {
        option("fast", "A chosen part of the rows, from all groups.", ""),
        option("only", "Rows that match, such as \"server/auth/*\".", "pattern"),
        option("jobs", "How many rows at a time (default: 2).", "number"),
        option("report", "Write the summary as a document; for a run of all rows.", "file"),
        option("keep", "Keep the world of every row in this folder.", "folder"),
        option("program", "What is started in veskw's place.", "path"),
        option("list", "Print the rows and run none.", ""),
    };
}

} // namespace

QString CampaignOptions::usage()
{
    QCommandLineParser parser;
    parser.addOptions(knownOptions());
    parser.setApplicationDescription(
        QStringLiteral("Runs the program through faults, each row of the tables in a world of its own, and "
                       "compares what is seen with what must be."));
    return parser.helpText();
}

bool CampaignOptions::parse(const QStringList &arguments, CampaignOptions *options, QString *error)
{
    QCommandLineParser parser;
    parser.addOptions(knownOptions());
    if (!parser.parse(arguments) || !parser.positionalArguments().isEmpty()) {
        *error = parser.errorText().isEmpty()
                     ? QStringLiteral("unknown word \"%1\"").arg(parser.positionalArguments().constFirst())
                     : parser.errorText();
        return false;
    }
    options->isFast = parser.isSet(QStringLiteral("fast"));
    options->only = parser.value(QStringLiteral("only"));
    options->report = parser.value(QStringLiteral("report"));
    options->keep = parser.value(QStringLiteral("keep"));
    if (parser.isSet(QStringLiteral("program")))
        options->program = QFileInfo(parser.value(QStringLiteral("program"))).absoluteFilePath();
    options->isListed = parser.isSet(QStringLiteral("list"));
    if (parser.isSet(QStringLiteral("jobs")))
        options->jobs = parser.value(QStringLiteral("jobs")).toInt();
    if (options->jobs < 1 || options->jobs > kMostJobs)
        *error = QStringLiteral("--jobs takes a number from 1 to %1").arg(kMostJobs);
    else if (!options->report.isEmpty() && (options->isFast || !options->only.isEmpty()))
        *error = QStringLiteral("--report is for a run of all rows");
    else if (!options->program.isEmpty() && !QFileInfo(options->program).isExecutable())
        *error = QStringLiteral("%1 is no program").arg(options->program);
    return error->isEmpty();
}

} // namespace sandbox
