// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

#include "journal/commandline.h"
#include "journal/error.h"
#include "scenario/scenario.h"
#include "state/userunits.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QFileInfo>

#include <cstdio>

#include <unistd.h>

using namespace sandbox;

namespace {

constexpr int kFailure = 125;

void print(const QByteArray &text, FILE *stream)
{
    std::fwrite(text.constData(), 1, static_cast<size_t>(text.size()), stream);
}

// A service of the user does nothing in a world but run until it is ended.
int serveUser()
{
    for (;;)
        ::pause();
}

int standInFor(const QString &name)
{
    const QString path = qEnvironmentVariable(StateDirectory::kVariable);
    if (path.isEmpty())
        throw Error(QStringLiteral("stands in for the real command inside a world only"));
    const StateDirectory state(path);
    const Outcome outcome = runCommand(name, QCoreApplication::arguments().mid(1), state,
                                       Scenario::load(state.scenarioFile()).command(name));
    print(outcome.output, stdout);
    print(outcome.errors, stderr);
    return outcome.exitCode;
}

} // namespace

// One program under several names: the links in the world's directory of commands.
int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    const QString name = QFileInfo(QFile::decodeName(argv[0])).fileName();
    if (UserUnits::names().contains(name))
        return serveUser();
    const QStringList known{QStringLiteral("gsettings"), QStringLiteral("systemctl"),
                            QStringLiteral("killall"), QStringLiteral("id")};
    try {
        if (known.contains(name))
            return standInFor(name);
        QCommandLineParser parser;
        const QString error =
            commandline::parse(parser, QCoreApplication::arguments(),
                               "Stands in for the commands of the enrolment program in a world.");
        throw Error(error.isEmpty()
                        ? QStringLiteral("is called as %1 only").arg(known.join(QStringLiteral(", ")))
                        : error);
    } catch (const Error &error) {
        return commandline::fail(error.text(), kFailure);
    }
}
