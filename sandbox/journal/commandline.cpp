// SPDX-License-Identifier: Apache-2.0
#include "commandline.h"

#include <QCommandLineParser>
#include <QCoreApplication>

#include <cstdio>

namespace sandbox {

QString commandline::parse(QCommandLineParser &parser, const QStringList &arguments, const char *description,
                           std::initializer_list<Option> options)
{
    QCoreApplication::setApplicationVersion(QStringLiteral(VESK_VERSION));
    parser.setApplicationDescription(QString::fromUtf8(description));
    parser.addHelpOption();
    parser.addVersionOption();
    for (const Option &option : options)
        parser.addOption({QString::fromUtf8(option.name), QString::fromUtf8(option.text),
                          QString::fromUtf8(option.value), QString::fromUtf8(option.standard)});
    if (!parser.parse(arguments))
        return parser.errorText();
    if (parser.isSet(QStringLiteral("help")))
        parser.showHelp();
    if (parser.isSet(QStringLiteral("version")))
        parser.showVersion();
    return {};
}

void commandline::say(const QString &line)
{
    std::printf("%s\n", qPrintable(line));
    std::fflush(stdout);
}

int commandline::fail(const QString &reason, int exitCode)
{
    std::fprintf(stderr, "%s: %s\n", qPrintable(QCoreApplication::applicationName()), qPrintable(reason));
    return exitCode;
}

} // namespace sandbox
