// SPDX-License-Identifier: Apache-2.0
#include "startcost.h"

#include "hand/screen.h"
#include "libraries.h"

#include <QDir>
#include <QFile>
#include <QStandardPaths>
#include <QThread>

namespace {

constexpr int kRounds = 11;
constexpr double kMaxInstructionsOfBare = 0.45;
constexpr double kMaxInstructionsOfLean = 1.15;
constexpr double kMaxMemoryOfBare = 0.42;
constexpr double kMaxMemoryOfLean = 1.12;

struct Memory
{
    double resident = 0; // KiB
    double proportional = 0;
};

struct Cost
{
    double instructions = 0;
    Memory memory;
    QStringList libraries;
    std::vector<double> milliseconds;
};

const char kJoinedRecord[] = "{\n    \"is_Domain\": true,\n    \"server_host\": \"server.example\",\n"
                             "    \"server_port\": \"443\",\n    \"domain_host\": \"server.example\",\n"
                             "    \"domain_port\": \"443\",\n    \"terminal_name\": \"terminal-01\"\n}\n";

// The file system that a measured program sees: one terminal that has joined, one that has not.
QString makeRoot(const Stage &stage, const QString &name, bool joined)
{
    QString root = stage.at(name);
    QDir().mkpath(root + QStringLiteral("/etc/vesk"));
    QFile record(root + QStringLiteral("/etc/vesk/userinfo.json"));
    if (joined && !(record.open(QIODevice::WriteOnly) && record.write(kJoinedRecord) > 0))
        Stage::giveUp(record.errorString());
    return root;
}

Memory memoryOf(const QByteArray &rollup)
{
    Memory memory;
    for (const QByteArray &line : rollup.split('\n')) {
        const double kilobytes = line.mid(line.indexOf(':') + 1).trimmed().split(' ').constFirst().toDouble();
        if (line.startsWith("Rss:"))
            memory.resident = kilobytes;
        if (line.startsWith("Pss:"))
            memory.proportional = kilobytes;
    }
    return memory;
}

class StartMeasurement
{
public:
    StartMeasurement(const Stage &stage, QString root)
        : m_stage(stage)
        , m_root(std::move(root))
    {
    }

    double instructionsOf(const QStringList &command, const char *fonts = Stage::kFewFonts) const
    {
        const QString profile = m_stage.at(QStringLiteral("start.callgrind"));
        runToFirstPaint(QStringList{QStringLiteral("valgrind"), QStringLiteral("--tool=callgrind"),
                                    QStringLiteral("--callgrind-out-file=") + profile} +
                            command,
                        fonts);
        return Stage::instructions(profile);
    }

    Cost costOf(const QStringList &command) const
    {
        Cost cost;
        cost.instructions = instructionsOf(command);

        runToFirstPaint(command);
        QFile seen(m_stage.at(QStringLiteral("first-paint")));
        if (!seen.open(QIODevice::ReadOnly))
            Stage::giveUp(seen.errorString());
        const QByteArray text = seen.readAll();
        cost.memory = memoryOf(text);
        cost.libraries = librariesIn(text);
        return cost;
    }

    // Seconds from exec to the first frame, the isolation around it included.
    double runToFirstPaint(const QStringList &command, const char *fonts = Stage::kFewFonts) const
    {
        QProcessEnvironment environment = m_stage.environment();
        environment.insert(QStringLiteral("FONTCONFIG_FILE"), m_stage.at(QLatin1String(fonts)));
        environment.insert(QStringLiteral("LD_PRELOAD"), m_stage.observer());
        environment.insert(QStringLiteral("VESK_BENCH_FIRST_PAINT"),
                           m_stage.at(QStringLiteral("first-paint")));
        return m_stage.run(isolated(command), environment);
    }

private:
    QStringList isolated(const QStringList &command) const
    {
        return QStringList{Stage::program("vesk-isolate"), QStringLiteral("--root"), m_root,
                           QStringLiteral("--writable"),   m_stage.at(QString()),    QStringLiteral("--")} +
               command;
    }

    const Stage &m_stage;
    QString m_root;
};

void measureTime(const StartMeasurement &measurement, const QStringList &command, const QStringList &lean,
                 Cost *cost, Cost *leanCost)
{
    for (int round = 0; round < kRounds; ++round) {
        cost->milliseconds.push_back(measurement.runToFirstPaint(command) * 1e3);
        leanCost->milliseconds.push_back(measurement.runToFirstPaint(lean) * 1e3);
    }
}

// Zenity draws by other means than the observer sees, so it is looked at from outside, once its window shows
// something.
Memory memoryOfZenity(const Stage &stage)
{
    QProcess zenity;
    zenity.setProcessEnvironment(stage.environment());
    zenity.start(QStringLiteral("zenity"),
                 {QStringLiteral("--forms"), QStringLiteral("--text=服务器配置"),
                  QStringLiteral("--add-entry=域地址:"), QStringLiteral("--add-entry=端口:")});
    qputenv("DISPLAY", stage.environment().value(QStringLiteral("DISPLAY")).toLocal8Bit());
    const bench::Screen screen;
    for (int tries = 0; tries < 500 && !screen.isPainted(); ++tries)
        QThread::msleep(10);
    QFile rollup(QStringLiteral("/proc/%1/smaps_rollup").arg(zenity.processId()));
    const Memory memory = rollup.open(QIODevice::ReadOnly) ? memoryOf(rollup.readAll()) : Memory();
    zenity.kill();
    zenity.waitForFinished();
    return memory;
}

Figures compare(const QString &page, const Cost &veskw, const Cost &bare, const Cost &lean)
{
    const QString instructions = page + QStringLiteral(": instructions to first paint");
    const QString memory = page + QStringLiteral(": RSS at first paint");
    const double million = 1e6;
    Figures figures{
        {instructions,
         veskw.instructions / million,
         QStringLiteral("M"),
         QStringLiteral("bare"),
         bare.instructions / million,
         kMaxInstructionsOfBare,
         {}},
        {instructions,
         veskw.instructions / million,
         QStringLiteral("M"),
         QStringLiteral("bare-lean"),
         lean.instructions / million,
         kMaxInstructionsOfLean,
         {}},
        {memory,
         veskw.memory.resident,
         QStringLiteral("KiB"),
         QStringLiteral("bare"),
         bare.memory.resident,
         kMaxMemoryOfBare,
         {}},
        {memory,
         veskw.memory.resident,
         QStringLiteral("KiB"),
         QStringLiteral("bare-lean"),
         lean.memory.resident,
         kMaxMemoryOfLean,
         {}},
        {page + QStringLiteral(": PSS at first paint"),
         veskw.memory.proportional,
         QStringLiteral("KiB"),
         QStringLiteral("bare-lean"),
         lean.memory.proportional,
         0,
         {}},
        librariesFigure(page, veskw.libraries, lean.libraries),
        pairedTimes(page + QStringLiteral(": time to first paint, isolation included"), veskw.milliseconds,
                    QStringLiteral("bare-lean"), lean.milliseconds, 0),
    };
    return figures;
}

} // namespace

Figures measureStart(const Stage &stage, double *firstPaint)
{
    const QStringList veskw{Stage::program("veskw")};
    const auto bare = [](const QStringList &arguments) {
        return QStringList{Stage::program("bench-bare")} + arguments;
    };
    const QString lean = QStringLiteral("--lean");
    Figures figures;
    for (const bool joined : {false, true}) {
        const QString page = joined ? QStringLiteral("panel") : QStringLiteral("server");
        const StartMeasurement measurement(stage, makeRoot(stage, page + QStringLiteral("-root"), joined));
        Cost cost = measurement.costOf(veskw);
        Cost leanCost = measurement.costOf(bare({lean, page}));
        const Cost bareCost = measurement.costOf(bare({page}));
        measureTime(measurement, veskw, bare({lean, page}), &cost, &leanCost);
        const QString title = joined ? QStringLiteral("leave panel") : QStringLiteral("server page");
        const Figures compared = compare(title, cost, bareCost, leanCost);
        figures.insert(figures.end(), compared.begin(), compared.end());
        figures.push_back({title + QStringLiteral(": instructions with 500 more families"),
                           measurement.instructionsOf(veskw, Stage::kManyFonts) / 1e6,
                           QStringLiteral("M"),
                           QStringLiteral("bare-lean"),
                           measurement.instructionsOf(bare({lean, page}), Stage::kManyFonts) / 1e6,
                           kMaxInstructionsOfLean,
                           {}});
        if (joined)
            continue;
        *firstPaint = cost.instructions;
        if (!QStandardPaths::findExecutable(QStringLiteral("zenity")).isEmpty())
            figures.push_back({QStringLiteral("server page: RSS at first paint"),
                               cost.memory.resident,
                               QStringLiteral("KiB"),
                               QStringLiteral("zenity"),
                               memoryOfZenity(stage).resident,
                               1.0,
                               {}});
    }
    return figures;
}
