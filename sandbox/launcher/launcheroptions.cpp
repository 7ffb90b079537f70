// SPDX-License-Identifier: Apache-2.0
#include "launcher/launcheroptions.h"

#include <QCommandLineParser>

namespace sandbox {

namespace {

void describe(QCommandLineParser &parser)
{
    const auto add = [&parser](const char *name, const char *text, const char *value = "") {
        parser.addOption({QLatin1String(name), QLatin1String(text), QLatin1String(value)});
    };
    parser.addHelpOption();
    parser.setApplicationDescription(QStringLiteral(
        "Starts an enrolment world on this machine and the enrolment program in it.\n"
        "\"vesk-sandbox scenarios\" lists situations that can be played, \"vesk-sandbox rows\"\n"
        "those of the fault campaign, \"vesk-sandbox show ROW\" prints one of them."));
    add("state", "Directory that keeps the world between runs (default: a temporary one).", "directory");
    add("scenario", "Situation to play (default: join-ok).", "name or file");
    add("autopilot", "Let the autopilot work the window: join or leave.", "journey");
    add("program", "Program to run inside (default: veskw).", "path");
    add("port", "Port of the enrolment address.", "number");
    add("pictures", "Directory for the autopilot's pictures (default: in the state directory).", "directory");
    add("headless", "Make a virtual display.");
    add("keep", "Keep the temporary directory.");
}

} // namespace

QString LauncherOptions::parse(const QStringList &arguments)
{
    QCommandLineParser parser;
    describe(parser);
    if (!parser.parse(arguments))
        return parser.errorText();
    if (parser.isSet(QStringLiteral("help")))
        parser.showHelp();
    const QStringList surplus = parser.positionalArguments();
    state = parser.value(QStringLiteral("state"));
    if (parser.isSet(QStringLiteral("scenario")))
        scenario = parser.value(QStringLiteral("scenario"));
    journey = parser.value(QStringLiteral("autopilot"));
    program = parser.value(QStringLiteral("program"));
    pictures = parser.value(QStringLiteral("pictures"));
    headless = parser.isSet(QStringLiteral("headless"));
    keep = parser.isSet(QStringLiteral("keep"));
    const QString number = parser.value(QStringLiteral("port"));
    port = number.toUShort();
    if (!surplus.isEmpty())
        return QStringLiteral("unknown word \"%1\"").arg(surplus.constFirst());
    if (!number.isEmpty() && port == 0)
        return QStringLiteral("--port takes a number from 1 to 65535, not \"%1\"").arg(number);
    if (parser.isSet(QStringLiteral("autopilot")) && journey != QLatin1String("join") &&
        journey != QLatin1String("leave"))
        return QStringLiteral("--autopilot takes join or leave, not \"%1\"").arg(journey);
    return {};
}

} // namespace sandbox
