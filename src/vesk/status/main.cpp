// SPDX-License-Identifier: Apache-2.0
// vesk-status: says what this terminal is and what is wrong with it. It needs no display, reads, and writes
// nothing but the file of a report.
#include "busthread.h"
#include "check.h"
#include "collectors.h"
#include "exitcodes.h"
#include "record.h"
#include "report.h"
#include "wellknownpaths.h"
#include "writers.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QLocale>
#include <QTranslator>

#include <cstdio>

namespace {

struct Status
{
    Findings findings;
    int exitCode;
};

Status currentStatus()
{
    const Record record = Record::read(QString::fromUtf8(vesk::kUserinfoPath));
    const Joined joined = record.joined();
    const Findings findings = terminalFindings(record) + credentialFindings(joined) + stagingFindings() +
                              serviceFindings() + desktopFindings() + commandFindings(joined);
    return {findings, exitCodeFor(joined, findings)};
}

// UTF-8 in every locale: so is the JSON.
void print(std::FILE *stream, const QString &text)
{
    const QByteArray bytes = text.toUtf8();
    std::fwrite(bytes.constData(), 1, static_cast<size_t>(bytes.size()), stream);
}

int show(const Findings &findings, int exitCode, bool asJson)
{
    print(stdout, asJson ? QString::fromUtf8(toJson(findings, exitCode)) : toText(findings));
    return exitCode;
}

int complain(const QString &text, int exitCode)
{
    print(stderr, QStringLiteral("vesk-status: %1\n").arg(text));
    return exitCode;
}

int check(const QString &where, bool asJson)
{
    const std::optional<ServerAddress> address = ServerAddress::parse(where);
    if (!address)
        return complain(Text::tr("%1 is not HOST:PORT").arg(where), exitcode::kWrongUse);
    ServerCheck server(*address);
    const int exitCode = server.run();
    return show(server.findings(), exitCode, asJson);
}

int tellExpiry(const QString &days, bool asJson)
{
    bool isNumber = false;
    const Findings findings = expiringCredentials(days.toInt(&isNumber));
    if (!isNumber)
        return complain(Text::tr("%1 is not a number of days").arg(days), exitcode::kWrongUse);
    return show(findings, exitCodeFor(true, findings), asJson);
}

int report(const QString &path)
{
    const Status status = currentStatus();
    QString error;
    if (!writeReport(path, toJson(status.findings, status.exitCode), &error))
        return complain(QStringLiteral("%1: %2").arg(path, error), exitcode::kCannotCreate);
    return exitcode::kSound;
}

int run(QCommandLineParser &parser)
{
    const QCommandLineOption json(QStringLiteral("json"), Text::tr("One JSON object instead of text."));
    const QCommandLineOption server(QStringLiteral("check"),
                                    Text::tr("Ask a server whether this terminal would join there."),
                                    QStringLiteral("HOST:PORT"));
    const QCommandLineOption expiry(QStringLiteral("expiry"),
                                    Text::tr("Only tell which certificates expire within so many days."),
                                    QStringLiteral("DAYS"));
    const QCommandLineOption file(QStringLiteral("report"),
                                  Text::tr("Write a report without keys and passwords into a new file."),
                                  QStringLiteral("FILE"));
    parser.setApplicationDescription(Text::tr("Tells what this terminal is, and what is wrong with it."));
    const QCommandLineOption help = parser.addHelpOption();
    const QCommandLineOption version = parser.addVersionOption();
    parser.addOptions({json, server, expiry, file});

    if (!parser.parse(QCoreApplication::arguments()))
        return complain(parser.errorText(), exitcode::kWrongUse);
    if (parser.isSet(help))
        parser.showHelp();
    if (parser.isSet(version))
        parser.showVersion();
    const bool asJson = parser.isSet(json);
    const int modes = int(parser.isSet(server)) + int(parser.isSet(expiry)) + int(parser.isSet(file));
    if (!parser.positionalArguments().isEmpty() || modes > 1 || (asJson && parser.isSet(file)))
        return complain(Text::tr("these arguments do not go together, see --help"), exitcode::kWrongUse);
    if (parser.isSet(server))
        return check(parser.value(server), asJson);
    if (parser.isSet(expiry))
        return tellExpiry(parser.value(expiry), asJson);
    if (!startBusThread())
        return complain(Text::tr("the D-Bus library cannot start its thread"), exitcode::kCannotTell);
    if (parser.isSet(file))
        return report(parser.value(file));
    const Status status = currentStatus();
    return show(status.findings, status.exitCode, asJson);
}

void keepQuiet(QtMsgType, const QMessageLogContext &, const QString &) {}

} // namespace

int main(int argc, char **argv)
{
    qInstallMessageHandler(keepQuiet); // findings tell what the base layer would warn of
    const QCoreApplication application(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("vesk-status"));
    QCoreApplication::setApplicationVersion(QStringLiteral(VESK_VERSION));
    QTranslator translator;
    if (translator.load(QLocale::system(), QStringLiteral("vesk-status"), QStringLiteral("_"),
                        QStringLiteral(":/translations")))
        QCoreApplication::installTranslator(&translator);
    QCommandLineParser parser;
    return run(parser);
}
