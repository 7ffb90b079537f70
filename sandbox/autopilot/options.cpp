// SPDX-License-Identifier: Apache-2.0
#include "options.h"

#include "trouble.h"

#include <QCommandLineParser>
#include <QDir>
#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>

namespace sandbox {

namespace {

constexpr int kLongestTimeout = 3600; // seconds

void describe(QCommandLineParser &parser)
{
    parser.setApplicationDescription(QStringLiteral("Works the window of the enrolment program through the "
                                                    "accessibility interface, as a screen reader does."));
    parser.addHelpOption();
    parser.addPositionalArgument(QStringLiteral("journey"), QStringLiteral("join or leave"));
    parser.addOptions({
        {QStringLiteral("scenario"), QStringLiteral("What to type and what to expect (default: join-ok)."),
         QStringLiteral("file or name"), QStringLiteral("join-ok")},
        {QStringLiteral("state"), QStringLiteral("State folder of the world: gives port and journal."),
         QStringLiteral("folder")},
        {QStringLiteral("port"), QStringLiteral("Port to type where the scenario names none."),
         QStringLiteral("number")},
        {QStringLiteral("pictures"), QStringLiteral("Folder for a picture of each page and message box."),
         QStringLiteral("folder")},
        {QStringLiteral("journal"), QStringLiteral("Journal that gets each step, too."),
         QStringLiteral("file")},
        {QStringLiteral("timeout"), QStringLiteral("Time limit of the whole walk in seconds (default: 120)."),
         QStringLiteral("seconds"), QStringLiteral("120")},
        {QStringLiteral("stay-after"),
         QStringLiteral(
             "Press nothing once the journal has a line with this text, and wait for the program's "
             "end."),
         QStringLiteral("text")},
        {QStringLiteral("program"),
         QStringLiteral("Name under which the program presents itself (default: %1).").arg(Options().program),
         QStringLiteral("name"), Options().program},
    });
}

Journey readJourney(const QStringList &words)
{
    if (words == QStringList{QStringLiteral("join")})
        return Journey::Join;
    if (words == QStringList{QStringLiteral("leave")})
        return Journey::Leave;
    throw Trouble(QStringLiteral("say join or leave, not \"%1\"").arg(words.join(QLatin1Char(' '))));
}

// A whole number from 1 to `greatest`.
int readNumber(const QString &option, const QString &text, int greatest)
{
    bool isNumber = false;
    const int number = text.toInt(&isNumber);
    if (!isNumber || number < 1 || number > greatest)
        throw Trouble(QStringLiteral("--%1 takes a number from 1 to %2, not \"%3\"")
                          .arg(option)
                          .arg(greatest)
                          .arg(text));
    return number;
}

// The port at which the server of a world listens for terminals that join.
QString readPort(const QString &stateFolder)
{
    const QString path = QDir(stateFolder).filePath(QStringLiteral("server/config.json"));
    const QString complaint = QStringLiteral("cannot read the port in %1: %2");
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        throw Trouble(complaint.arg(path, file.errorString()));
    const QJsonObject config = QJsonDocument::fromJson(file.readAll()).object();
    const int port = config.value(QStringLiteral("enrolment_port")).toInt();
    if (port == 0)
        throw Trouble(complaint.arg(path, QStringLiteral("\"enrolment_port\" names none")));
    return QString::number(port);
}

void takeFromState(Options &options, const QString &stateFolder)
{
    if (options.journal.isEmpty())
        options.journal = QDir(stateFolder).filePath(QStringLiteral("journal.log"));
    if (options.port.isEmpty())
        options.port = readPort(stateFolder);
}

} // namespace

Options readOptions(const QStringList &arguments)
{
    QCommandLineParser parser;
    describe(parser);
    if (!parser.parse(arguments))
        throw Trouble(parser.errorText());
    if (parser.isSet(QStringLiteral("help")))
        parser.showHelp(0);

    Options options;
    options.journey = readJourney(parser.positionalArguments());
    options.scenario = parser.value(QStringLiteral("scenario"));
    options.program = parser.value(QStringLiteral("program"));
    options.journal = parser.value(QStringLiteral("journal"));
    options.stayAfter = parser.value(QStringLiteral("stay-after"));
    options.pictures = parser.value(QStringLiteral("pictures"));
    options.timeout =
        readNumber(QStringLiteral("timeout"), parser.value(QStringLiteral("timeout")), kLongestTimeout);
    options.port = parser.value(QStringLiteral("port"));
    if (!options.port.isEmpty())
        readNumber(QStringLiteral("port"), options.port, 65535);
    if (parser.isSet(QStringLiteral("state")))
        takeFromState(options, parser.value(QStringLiteral("state")));
    return options;
}

} // namespace sandbox
