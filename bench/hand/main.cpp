// SPDX-License-Identifier: Apache-2.0
// Works a measured program inside a sandbox world; started there in the program's place.
//
//   bench-hand join|fail OBSERVER QUIET_MS OUTPUT PROGRAM [ARGUMENT...]
//
// OBSERVER is the library to load into PROGRAM, OUTPUT the file that gets the walk's times as JSON.
#include "screen.h"
#include "trace.h"
#include "walk.h"

#include <QCoreApplication>
#include <QFile>
#include <QFileInfo>
#include <QJsonDocument>
#include <QProcess>
#include <QRegularExpression>

#include <cstdio>

namespace {

constexpr int kAttempts = 210;
constexpr int kEndLimitMs = 60000;

QString enrolmentPort()
{
    QFile journal(qEnvironmentVariable("VESK_SANDBOX_STATE") + QStringLiteral("/journal.log"));
    if (!journal.open(QIODevice::ReadOnly))
        return {};
    static const QRegularExpression line(QStringLiteral("enrolment port (\\d+)"));
    return line.match(QString::fromUtf8(journal.readAll())).captured(1);
}

int complain(const QString &text)
{
    std::fprintf(stderr, "bench-hand: %s\n", qPrintable(text));
    return 1;
}

} // namespace

int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    QStringList arguments = QCoreApplication::arguments().mid(1);
    if (arguments.size() < 5)
        return complain(
            QStringLiteral("usage: bench-hand join|fail OBSERVER QUIET_MS OUTPUT PROGRAM [ARGUMENT...]"));
    const QString journey = arguments.takeFirst();
    const QString observer = arguments.takeFirst();
    const int quietMs = arguments.takeFirst().toInt();
    QFile output(QFileInfo(arguments.takeFirst()).absoluteFilePath());
    if (!output.open(QIODevice::WriteOnly))
        return complain(output.errorString());

    // LD_PRELOAD takes a blank in a path for its end; the output's path has none.
    const QString preload = output.fileName() + QStringLiteral(".observer.so");
    if (!QFile::link(observer, preload))
        return complain(QStringLiteral("cannot create %1").arg(preload));

    const QString fifo = output.fileName() + QStringLiteral(".trace");
    Trace trace(fifo);
    bench::Screen screen;
    if (!screen.isConnected())
        return complain(QStringLiteral("no display"));

    QProcess program;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("LD_PRELOAD"), preload);
    environment.insert(QStringLiteral("VESK_BENCH_TRACE"), fifo);
    program.setProcessEnvironment(environment);
    program.setProcessChannelMode(QProcess::ForwardedChannels);
    program.start(arguments.takeFirst(), arguments);
    if (!program.waitForStarted())
        return complain(program.errorString());

    Walk walk(screen, trace, quietMs);
    const QJsonArray times = journey == QLatin1String("join")
                                 ? walk.join(enrolmentPort())
                                 : walk.failAtAccount(enrolmentPort(), kAttempts, program.processId());
    program.terminate();
    program.waitForFinished(kEndLimitMs);
    if (times.isEmpty())
        return complain(walk.error());
    output.write(QJsonDocument(times).toJson());
    return 0;
}
