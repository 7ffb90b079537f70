// SPDX-License-Identifier: Apache-2.0
#include "joincost.h"

#include <QDir>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QStandardPaths>

namespace {

constexpr int kRounds = 9;
constexpr int kQuietMs = 60;
constexpr int kSlowMotionQuietMs = 2000; // under callgrind
constexpr double kMaxInstructions = 1.0;
constexpr double kMaxTime = 1.10;
constexpr double kMaxGrowthKilobytes = 1024;
constexpr double kMaxLatencyMs = 50;

// The commands of the machine are the same for both and count for neither.
const char kSkipped[] = "--trace-children-skip=*/gsettings,*/systemctl";

// Runs a shell's `command` in the program's place in a new world, from the world's directory, which it gives.
QString playWorld(const Stage &stage, const QString &name, const QString &scenario, const QString &command)
{
    QString world = stage.at(name);
    QDir().mkpath(world);
    const QString program = stage.script(name + QStringLiteral(".sh"),
                                         QStringLiteral("cd %1\nexec %2").arg(Stage::quoted(world), command));
    stage.run({Stage::program("vesk-sandbox"), QStringLiteral("--state"), world, QStringLiteral("--headless"),
               QStringLiteral("--scenario"), scenario, QStringLiteral("--program"), program},
              stage.environment());
    return world;
}

QString hand(const char *journey, int quietMs, const QString &prefix)
{
    const QStringList words{Stage::quoted(Stage::program("bench-hand")),
                            QLatin1String(journey),
                            Stage::quoted(Stage::builtObserver()),
                            QString::number(quietMs),
                            QStringLiteral("times.json"),
                            prefix,
                            Stage::quoted(Stage::program("veskw"))};
    return words.join(QLatin1Char(' '));
}

QJsonArray timesIn(const QString &world)
{
    QFile file(world + QStringLiteral("/times.json"));
    QJsonArray times =
        file.open(QIODevice::ReadOnly) ? QJsonDocument::fromJson(file.readAll()).array() : QJsonArray();
    if (times.isEmpty())
        Stage::giveUp(QStringLiteral("the walk in %1 has left no times").arg(world));
    return times;
}

double instructionsOfProgram(const Stage &stage)
{
    const QString world =
        playWorld(stage, QStringLiteral("join-callgrind"), QStringLiteral("join-ok"),
                  hand("join", kSlowMotionQuietMs,
                       QStringLiteral("valgrind --tool=callgrind --callgrind-out-file=callgrind.out")));
    timesIn(world);
    return Stage::instructions(world + QStringLiteral("/callgrind.out"));
}

double instructionsOfScript(const Stage &stage)
{
    const QString world =
        playWorld(stage, QStringLiteral("script-callgrind"), QStringLiteral("join-ok"),
                  QStringLiteral("valgrind --tool=callgrind --trace-children=yes '%1' "
                                 "--callgrind-out-file=callgrind.%p %2")
                      .arg(QLatin1String(kSkipped), Stage::quoted(Stage::program("bench-join.sh"))));
    double sum = 0;
    const QStringList files = QDir(world).entryList({QStringLiteral("callgrind.*")});
    for (const QString &file : files)
        sum += Stage::instructions(world + QLatin1Char('/') + file);
    return sum;
}

double scriptMilliseconds(const Stage &stage, int round)
{
    const QString world =
        playWorld(stage, QStringLiteral("script-%1").arg(round), QStringLiteral("join-ok"),
                  Stage::quoted(Stage::program("bench-join.sh")) + QStringLiteral(" >milliseconds"));
    QFile file(world + QStringLiteral("/milliseconds"));
    if (!file.open(QIODevice::ReadOnly))
        Stage::giveUp(file.errorString());
    return file.readAll().trimmed().toDouble();
}

struct Times
{
    std::vector<double> program;
    std::vector<double> script;
    std::vector<double> clickToRequest;
    std::vector<double> replyToPaint;
};

Times measureTimes(const Stage &stage, bool withScript)
{
    Times times;
    for (int round = 0; round < kRounds; ++round) {
        const QString world = playWorld(stage, QStringLiteral("join-%1").arg(round),
                                        QStringLiteral("join-ok"), hand("join", kQuietMs, {}));
        double sum = 0;
        const QJsonArray steps = timesIn(world);
        for (const QJsonValue &value : steps) {
            const QJsonObject step = value.toObject();
            sum += step.value(QStringLiteral("click_to_paint_ms")).toDouble();
            times.replyToPaint.push_back(step.value(QStringLiteral("reply_to_paint_ms")).toDouble());
            if (step.contains(QStringLiteral("click_to_request_ms")))
                times.clickToRequest.push_back(step.value(QStringLiteral("click_to_request_ms")).toDouble());
        }
        times.program.push_back(sum);
        if (withScript)
            times.script.push_back(scriptMilliseconds(stage, round));
    }
    return times;
}

Figure growth(const Stage &stage)
{
    const QString world = playWorld(stage, QStringLiteral("attempts"), QStringLiteral("join-ok"),
                                    hand("fail", kQuietMs / 4, {}));
    const QJsonArray samples = timesIn(world);
    const auto resident = [](const QJsonValue &sample) {
        return sample.toObject().value(QStringLiteral("rss_kb")).toDouble();
    };
    Figure figure{QStringLiteral("growth of RSS over 200 wrong passwords"),
                  resident(samples.last()) - resident(samples.first()),
                  QStringLiteral("KiB"),
                  {},
                  0,
                  kMaxGrowthKilobytes,
                  {}};
    figure.remark =
        QStringLiteral("from the 10th attempt to the 210th, each with its message box; RSS then %1 KiB")
            .arg(resident(samples.last()));
    return figure;
}

bool isInstalled(const char *program)
{
    return !QStandardPaths::findExecutable(QLatin1String(program)).isEmpty();
}

} // namespace

Figures measureJoin(const Stage &stage, double firstPaint)
{
    const double million = 1e6;
    const bool withScript = isInstalled("curl") && isInstalled("busctl");
    const QString instructions = QStringLiteral("join: instructions, first paint excluded");
    const QString time = QStringLiteral("join: time, the user's own excluded");
    const double program = (instructionsOfProgram(stage) - firstPaint) / million;
    const Times times = measureTimes(stage, withScript);

    Figures figures;
    if (withScript) {
        figures.push_back({instructions,
                           program,
                           QStringLiteral("M"),
                           QStringLiteral("script"),
                           instructionsOfScript(stage) / million,
                           kMaxInstructions,
                           {}});
        figures.push_back(pairedTimes(time, times.program, QStringLiteral("script"), times.script, kMaxTime));
    } else {
        const QString why =
            QStringLiteral("curl or busctl is not installed, so there is no script to compare with");
        figures.push_back({instructions, program, QStringLiteral("M"), {}, 0, 0, why});
        figures.push_back({time, median(times.program), QStringLiteral("ms"), {}, 0, 0, why});
    }
    figures.push_back({QStringLiteral("join: from click to the request on the wire"),
                       median(times.clickToRequest),
                       QStringLiteral("ms"),
                       {},
                       0,
                       kMaxLatencyMs,
                       {}});
    figures.push_back({QStringLiteral("join: from reply to the next page painted"),
                       median(times.replyToPaint),
                       QStringLiteral("ms"),
                       {},
                       0,
                       kMaxLatencyMs,
                       {}});
    figures.push_back(growth(stage));
    return figures;
}
