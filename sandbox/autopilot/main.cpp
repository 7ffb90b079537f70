// SPDX-License-Identifier: Apache-2.0
#include "waitfor.h"
#include "walk.h"

#include "journal/commandline.h"
#include "journal/smallfile.h"

#include <QCommandLineParser>
#include <QCoreApplication>

using namespace sandbox;

namespace {

constexpr int kActionLimitMs = 10000;
constexpr int kMaxInstances = 2;
constexpr int kMaxSeconds = 3600;

// The port of the world, to type where the scenario names none.
QString portOf(const QString &state)
{
    const QJsonObject config = smallfile::readObject(state + QStringLiteral("/server/config.json"));
    const int port = config.value(QStringLiteral("enrolment_port")).toInt();
    if (port == 0)
        throw Error(QStringLiteral("no port is known: give the world with --state"));
    return QString::number(port);
}

void walk(const QCommandLineParser &options, const WalkPlan &plan, const QDeadlineTimer &deadline)
{
    const QString state = options.value(QStringLiteral("state"));
    const QString journal = state.isEmpty() ? QString() : state + QStringLiteral("/journal.log");
    const Logbook logbook{Journal(journal)};
    try {
        const AccessibleTree tree(options.value(QStringLiteral("program")), deadline);
        Walk(plan, tree, logbook, deadline).run();
    } catch (const Error &error) {
        logbook.note(QStringLiteral("fail"), error.text()); // the last line of the journal says why
        throw;
    }
}

WalkPlan planOf(const QCommandLineParser &options)
{
    WalkPlan plan;
    const QString journey = options.positionalArguments().join(QLatin1Char(' '));
    if (journey != QLatin1String("join") && journey != QLatin1String("leave"))
        throw Error(QStringLiteral("the journey is join or leave, not \"%1\"").arg(journey));
    plan.journey = journey == QLatin1String("join") ? Journey::Join : Journey::Leave;
    const Scenario scenario = Scenario::load(Scenario::pathOf(options.value(QStringLiteral("scenario"))));
    plan.input = scenario.input();
    if (plan.journey == Journey::Join && plan.input.port.isEmpty() && !plan.input.host.isEmpty())
        plan.input.port = portOf(options.value(QStringLiteral("state")));
    plan.expect = scenario.expectation();
    plan.screenshots = options.value(QStringLiteral("screenshots"));
    plan.stayAfter = options.value(QStringLiteral("stay-after"));
    return plan;
}

// The button to press in this window, or null.
const Element *choose(const Element &window, const QString &action, const QString &text)
{
    if (action == QLatin1String("press"))
        return window.button(text);
    return window.labels().contains(text) ? window.button(QStringLiteral("确定")) : nullptr;
}

bool performActionIn(const AccessibleTree &tree, const QString &action, const QString &text)
{
    for (const Element &window : tree.windows()) {
        if (const Element *button = choose(window, action, text)) {
            tree.press(*button, QDeadlineTimer(kActionLimitMs));
            return true;
        }
    }
    return false;
}

// For the campaign, one action beside a walk of another process, on whichever instance of the program shows
// the thing. action: "press", and text is that of a button, enabled or not; or "answer", and text is that of
// a message box, which is closed by its button.
void performAction(const QString &action, const QString &program, const QString &text)
{
    waitFor(QDeadlineTimer(kActionLimitMs), QStringLiteral("%1 does not show").arg(text), [&] {
        try {
            for (int instance = 0; instance < kMaxInstances; ++instance) {
                if (performActionIn(AccessibleTree(program, QDeadlineTimer(0), instance), action, text))
                    return true;
            }
        } catch (const Error &) {
            // There is no further one yet.
        }
        return false;
    });
}

void run()
{
    QCommandLineParser parser;
    parser.addPositionalArgument(QStringLiteral("journey"), QStringLiteral("join or leave"));
    const QString error = commandline::parse(
        parser, QCoreApplication::arguments(),
        "Works the window of the enrolment program through the accessibility interface, as a screen reader "
        "does.",
        {{"scenario", "What to type and what to expect (default: join-ok).", "file or name", "join-ok"},
         {"state", "State directory of the world: gives port and journal.", "directory"},
         {"screenshots", "Directory for a screenshot of each page and message box.", "directory"},
         {"timeout", "Time limit of the whole walk in seconds (default: 120).", "seconds", "120"},
         {"stay-after",
          "Press nothing once the journal has a line with this text, and wait for the program's end.",
          "text"},
         {"program", "Name under which the program presents itself (default: 维斯克平台).", "name",
          "维斯克平台"}});
    if (!error.isEmpty())
        throw Error(error);
    const QStringList words = parser.positionalArguments();
    if (words.size() == 3 &&
        QStringList{QStringLiteral("press"), QStringLiteral("answer")}.contains(words.first()))
        return performAction(words.at(0), words.at(1), words.at(2));
    const int seconds = parser.value(QStringLiteral("timeout")).toInt();
    if (seconds < 1 || seconds > kMaxSeconds)
        throw Error(QStringLiteral("--timeout takes a number from 1 to %1").arg(kMaxSeconds));
    walk(parser, planOf(parser), QDeadlineTimer(seconds * 1000LL));
}

} // namespace

int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    try {
        run();
        return 0;
    } catch (const std::exception &problem) {
        return commandline::fail(QString::fromUtf8(problem.what()), 1);
    }
}
