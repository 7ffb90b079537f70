// SPDX-License-Identifier: Apache-2.0
#include "launcher/launcheroptions.h"

#include <QCommandLineParser>

namespace sandbox {

namespace {

QList<QCommandLineOption> knownOptions()
{
    const auto option = [](const char *name, const char *text, const char *value) {
        return QCommandLineOption(QLatin1String(name), QLatin1String(text), QLatin1String(value));
    };
    return {
        option("state", "Folder that keeps the world between runs (default: a temporary one).", "folder"),
        option("scenario", "Situation to play (default: join-ok).", "name or file"),
        option("autopilot", "Let the autopilot work the window: join or leave.", "journey"),
        option("program", "Program to run inside (default: veskw).", "path"),
        option("port", "Port of the enrolment address.", "number"),
        option("pictures", "Folder for the autopilot's pictures (default: in the state folder).", "folder"),
        option("headless", "Make a virtual display.", ""),
        option("keep", "Keep the temporary folder.", ""),
    };
}

bool readPort(const QCommandLineParser &parser, quint16 *port, QString *error)
{
    const QString text = parser.value(QStringLiteral("port"));
    bool isNumber = false;
    *port = text.isEmpty() ? 0 : text.toUShort(&isNumber);
    if (!text.isEmpty() && (!isNumber || *port == 0))
        *error = QStringLiteral("--port takes a number from 1 to 65535, not \"%1\"").arg(text);
    return error->isEmpty();
}

bool readJourney(const QCommandLineParser &parser, QString *journey, QString *error)
{
    *journey = parser.value(QStringLiteral("autopilot"));
    if (parser.isSet(QStringLiteral("autopilot")) && *journey != QLatin1String("join") &&
        *journey != QLatin1String("leave"))
        *error = QStringLiteral("--autopilot takes join or leave, not \"%1\"").arg(*journey);
    return error->isEmpty();
}

} // namespace

QString LauncherOptions::usage()
{
    QCommandLineParser parser;
    parser.addOptions(knownOptions());
    parser.setApplicationDescription(QStringLiteral(
        "Starts an enrolment world on this machine and the enrolment program in it.\n"
        "\"vesk-sandbox scenarios\" lists situations that can be played, \"vesk-sandbox rows\"\n"
        "those of the fault campaign, \"vesk-sandbox show ROW\" prints one of them."));
    return parser.helpText();
}

bool LauncherOptions::parse(const QStringList &arguments, LauncherOptions *options, QString *error)
{
    QCommandLineParser parser;
    parser.addOptions(knownOptions());
    if (!parser.parse(arguments) || !parser.positionalArguments().isEmpty()) {
        *error = parser.errorText().isEmpty()
                     ? QStringLiteral("unknown word \"%1\"").arg(parser.positionalArguments().constFirst())
                     : parser.errorText();
        return false;
    }
    options->state = parser.value(QStringLiteral("state"));
    if (parser.isSet(QStringLiteral("scenario")))
        options->scenario = parser.value(QStringLiteral("scenario"));
    options->headless = parser.isSet(QStringLiteral("headless"));
    options->program = parser.value(QStringLiteral("program"));
    options->pictures = parser.value(QStringLiteral("pictures"));
    options->keep = parser.isSet(QStringLiteral("keep"));
    return readPort(parser, &options->port, error) && readJourney(parser, &options->journey, error);
}

} // namespace sandbox
