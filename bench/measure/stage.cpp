// SPDX-License-Identifier: Apache-2.0
#include "stage.h"

#include <QCoreApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>

#include <cstdio>
#include <cstdlib>

namespace {

constexpr int kServerLimitMs = 10000;
constexpr int kRunLimitMs = 240000;
constexpr int kFamilies = 500;
constexpr char kSmallFont[] = "/usr/share/fonts/truetype/dejavu/DejaVuSansMono.ttf";
constexpr char kDependency[] = "/usr/share/fonts/opentype/noto/Noto%1CJK-%2.ttc";

} // namespace

Stage::Stage()
    : m_directory(QStringLiteral("/var/tmp/vesk-bench-XXXXXX")) // worlds have a /tmp of their own
{
    QFile::link(builtObserver(), observer());
    m_displayName =
        QLatin1Char(':') +
        startServer(m_display, QStringLiteral("Xvfb"),
                    {QStringLiteral("-displayfd"), QStringLiteral("1"), QStringLiteral("-screen"),
                     QStringLiteral("0"), QStringLiteral("1280x1024x24"), QStringLiteral("-nolisten"),
                     QStringLiteral("tcp"), QStringLiteral("-noreset")});
    m_busAddress = startServer(
        m_bus, QStringLiteral("dbus-daemon"),
        {QStringLiteral("--session"), QStringLiteral("--nofork"), QStringLiteral("--print-address")});
    QFile::setPermissions(m_directory.path(), QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    makeFonts();
}

Stage::~Stage()
{
    for (QProcess *server : {&m_display, &m_bus}) {
        server->terminate();
        server->waitForFinished();
    }
}

QString Stage::program(const char *name)
{
    return QCoreApplication::applicationDirPath() + QLatin1Char('/') + QLatin1String(name);
}

QString Stage::builtObserver()
{
    return QCoreApplication::applicationDirPath() + QStringLiteral("/../lib/bench-observer.so");
}

QProcessEnvironment Stage::environment() const
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("DISPLAY"), m_displayName);
    environment.insert(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"), m_busAddress);
    environment.insert(QStringLiteral("XDG_RUNTIME_DIR"), m_directory.path());
    environment.insert(QStringLiteral("LC_ALL"), QStringLiteral("C.UTF-8"));
    environment.insert(QStringLiteral("FONTCONFIG_FILE"), at(QLatin1String(kFewFonts)));
    return environment;
}

double Stage::run(const QStringList &command, const QProcessEnvironment &environment) const
{
    QProcess process;
    process.setProcessEnvironment(environment);
    process.setProcessChannelMode(QProcess::MergedChannels);
    QElapsedTimer timer;
    timer.start();
    process.start(command.constFirst(), command.mid(1));
    if (!process.waitForFinished(kRunLimitMs) || process.exitStatus() != QProcess::NormalExit ||
        process.exitCode() != 0)
        giveUp(QStringLiteral("%1 failed: %2").arg(command.join(QLatin1Char(' ')), process.errorString()) +
               QLatin1Char('\n') + QString::fromLocal8Bit(process.readAll().right(2000)));
    return static_cast<double>(timer.nsecsElapsed()) / 1e9;
}

QString Stage::script(const QString &name, const QString &command) const
{
    QString path = write(name, "#!/bin/sh\n" + command.toLocal8Bit() + '\n');
    QFile::setPermissions(path, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    return path;
}

QString Stage::quoted(QString word)
{
    return QLatin1Char('\'') + word.replace(QLatin1Char('\''), QLatin1String("'\\''")) + QLatin1Char('\'');
}

double Stage::instructions(const QString &callgrindFile)
{
    QFile file(callgrindFile);
    if (!file.open(QIODevice::ReadOnly))
        giveUp(file.fileName() + QStringLiteral(": ") + file.errorString());
    double count = 0;
    while (!file.atEnd()) {
        const QByteArray line = file.readLine();
        if (line.startsWith("totals: "))
            count += line.mid(8).trimmed().toDouble();
    }
    return count;
}

void Stage::giveUp(const QString &why)
{
    std::fprintf(stderr, "vesk-bench: %s\n", qPrintable(why));
    std::exit(1);
}

QString Stage::write(const QString &name, const QByteArray &content) const
{
    QFile file(at(name));
    if (!file.open(QIODevice::WriteOnly) || file.write(content) != content.size())
        giveUp(file.errorString());
    return file.fileName();
}

void Stage::link(const QString &font, const QString &name) const
{
    if (!QFile::exists(font) || !QFile::link(font, at(name)))
        giveUp(QStringLiteral("cannot link %1: is it installed?").arg(font));
}

// No rule of the machine is among them. The families' names come from rules that only the making of the cache
// reads: measured programs would pay for each.
void Stage::makeFonts() const
{
    QDir().mkpath(at(QStringLiteral("dependency")));
    QDir().mkpath(at(QStringLiteral("families")));
    for (const char *style : {"Sans", "Serif"}) {
        for (const char *weight : {"Regular", "Bold"}) {
            const QString font =
                QString::fromLatin1(kDependency).arg(QLatin1String(style), QLatin1String(weight));
            link(font, QStringLiteral("dependency/") + QFileInfo(font).fileName());
        }
    }
    QString names;
    for (int i = 0; i < kFamilies; ++i) {
        link(QLatin1String(kSmallFont), QStringLiteral("families/Family %1.ttf").arg(i));
        names += QStringLiteral("<match target=\"scan\"><test name=\"file\" compare=\"contains\">"
                                "<string>/Family %1.ttf</string></test>"
                                "<edit name=\"family\"><string>Family %1</string></edit></match>\n")
                     .arg(i);
    }
    const QString few = QStringLiteral("<dir>%1</dir><cachedir>%2</cachedir>\n")
                            .arg(at(QStringLiteral("dependency")), at(QStringLiteral("fontcache")));
    const QString many = few + QStringLiteral("<dir>%1</dir>\n").arg(at(QStringLiteral("families")));
    const auto configure = [this](const QString &name, const QString &rules) {
        return write(name, "<fontconfig>\n" + rules.toLocal8Bit() + "</fontconfig>\n");
    };
    configure(QLatin1String(kFewFonts), few);
    configure(QLatin1String(kManyFonts), many);
    QProcessEnvironment caching = environment();
    caching.insert(QStringLiteral("FONTCONFIG_FILE"), configure(QStringLiteral("caching"), many + names));
    run({QStringLiteral("fc-cache")}, caching);
}

QString Stage::startServer(QProcess &server, const QString &program, const QStringList &arguments)
{
    server.setStandardErrorFile(at(program + QStringLiteral(".log")));
    server.start(program, arguments);
    if (!server.waitForStarted(kServerLimitMs) || !server.waitForReadyRead(kServerLimitMs))
        giveUp(QStringLiteral("%1 does not start: %2").arg(program, server.errorString()));
    return QString::fromLocal8Bit(server.readLine()).trimmed();
}
