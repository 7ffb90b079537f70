// SPDX-License-Identifier: Apache-2.0
#include "options.h"
#include "sidehand.h"
#include "trouble.h"
#include "walk.h"

#include <QCoreApplication>
#include <QGuiApplication>

#include <xcb/xcb.h>

#include <cstdio>

using namespace sandbox;

namespace {

// Qt ends the process with a core dump when there is no display, so we look first.
void mustHaveDisplay()
{
    xcb_connection_t *connection = xcb_connect(nullptr, nullptr);
    const bool isThere = xcb_connection_has_error(connection) == 0;
    xcb_disconnect(connection);
    if (!isThere) {
        throw Trouble(QStringLiteral("pictures need the display of the program, but DISPLAY is \"%1\"")
                          .arg(qEnvironmentVariable("DISPLAY")));
    }
}

// Only pictures need a connection to the display.
std::unique_ptr<QCoreApplication> makeApplication(int &argc, char **argv, bool takesPictures)
{
    if (!takesPictures)
        return std::make_unique<QCoreApplication>(argc, argv);
    mustHaveDisplay();
    return std::make_unique<QGuiApplication>(argc, argv);
}

Scenario loadScenario(const QString &nameOrFile)
{
    QString error;
    const std::optional<Scenario> scenario = Scenario::load(Scenario::pathOf(nameOrFile), &error);
    if (!scenario)
        throw Trouble(error);
    return *scenario;
}

ScenarioInput inputOf(const Scenario &scenario, const Options &options)
{
    ScenarioInput input = scenario.input();
    if (input.port.isEmpty())
        input.port = options.port;
    if (input.port.isEmpty() && options.journey == Journey::Join)
        throw Trouble(
            QStringLiteral("the scenario %1 names no port: give one with --port").arg(options.scenario));
    return input;
}

void walk(const Options &options, const Logbook &logbook)
{
    const QDeadlineTimer deadline(qint64(options.timeout) * 1000);
    const Scenario scenario = loadScenario(options.scenario);
    const ScenarioInput input = inputOf(scenario, options);
    const ScenarioExpectation expectation = scenario.expectation();
    const Camera camera(options.pictures);
    const AccessibleTree tree(options.program, deadline);
    Walk walk(options.journey, input, expectation, tree, logbook, camera, deadline);
    walk.stayAfter(options.stayAfter);
    walk.run();
}

// The last line of the journal says why a walk failed.
void walkOnRecord(const Options &options)
{
    const Logbook logbook(options.journal);
    try {
        walk(options, logbook);
    } catch (const Trouble &trouble) {
        logbook.note(QStringLiteral("fail"), trouble.text());
        throw;
    }
}

// "press PROGRAM BUTTON" and "answer PROGRAM MESSAGE": one deed beside a walk of another process.
bool lendHand(int &argc, char **argv, const QStringList &arguments)
{
    if (arguments.size() != 4)
        return false;
    const QCoreApplication application(argc, argv);
    if (arguments.at(1) == QLatin1String("press"))
        sidehand::press(arguments.at(2), arguments.at(3));
    else if (arguments.at(1) == QLatin1String("answer"))
        sidehand::answer(arguments.at(2), arguments.at(3));
    else
        return false;
    return true;
}

void run(int &argc, char **argv)
{
    QStringList arguments;
    for (int i = 0; i < argc; ++i)
        arguments.append(QString::fromLocal8Bit(argv[i]));
    if (lendHand(argc, argv, arguments))
        return;
    const Options options = readOptions(arguments);
    const auto application = makeApplication(argc, argv, !options.pictures.isEmpty());
    walkOnRecord(options);
}

} // namespace

int main(int argc, char **argv)
{
    try {
        run(argc, argv);
        return 0;
    } catch (const std::exception &problem) {
        std::fprintf(stderr, "vesk-autopilot: %s\n", problem.what());
        return 1;
    }
}
