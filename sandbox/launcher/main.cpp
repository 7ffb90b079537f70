// SPDX-License-Identifier: Apache-2.0
#include "campaign/commands.h"
#include "journal/commandline.h"
#include "journal/error.h"
#include "launcher/launcher.h"
#include "services/servicehost.h"

#include <QCoreApplication>

#include <cstdio>

using namespace sandbox;

namespace {

constexpr int kUsageError = 2;

int listScenarios(const QStringList & /*arguments*/)
{
    int exitCode = 0;
    for (const QString &name : Scenario::names()) {
        QString error;
        const auto print = [&name] {
            std::printf("%-26s %s\n", qPrintable(name),
                        qPrintable(Scenario::load(Scenario::pathOf(name)).title()));
        };
        if (!attempt(&error, print))
            exitCode = commandline::fail(error, kUsageError);
    }
    return exitCode;
}

// The launcher starts itself in this way, once for each service.
int serve(const QStringList &arguments)
{
    if (arguments.size() != 5 || arguments.at(3) != QLatin1String("--state"))
        return commandline::fail(QStringLiteral("usage: vesk-sandbox service NAME --state DIRECTORY"),
                                 kUsageError);
    return servicehost::run(arguments.at(2), arguments.at(4));
}

int launch(const QStringList &arguments)
{
    QCommandLineParser options;
    const QString error = Launcher::parse(options, arguments);
    return error.isEmpty() ? Launcher(options).run()
                           : commandline::fail(error + QStringLiteral(" (--help tells more)"), kUsageError);
}

} // namespace

int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    static const QMap<QString, int (*)(const QStringList &)> words = {
        {QStringLiteral("scenarios"), listScenarios}, {QStringLiteral("service"), serve},
        {QStringLiteral("rows"), listRows},           {QStringLiteral("show"), showRow},
        {QStringLiteral("worlds"), makeWorlds},       {QStringLiteral("run"), runRow},
    };
    try {
        return words.value(arguments.value(1), launch)(arguments);
    } catch (const Error &error) {
        return commandline::fail(error.text(), 1);
    }
}
