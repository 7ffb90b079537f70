// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QProcess>
#include <QString>
#include <QStringList>
#include <QTemporaryDir>

// Where the measured programs run: a virtual display, a session bus, fonts of its own and a directory that
// goes away afterwards. A failure of any of it ends the measurement with one line, since no figure is worth
// anything then.
class Stage
{
public:
    Stage();
    ~Stage();
    Stage(const Stage &) = delete;
    Stage &operator=(const Stage &) = delete;

    // A path in the stage's directory, without blanks, which measured programs may write.
    QString at(const QString &name) const { return m_directory.filePath(name); }

    static QString program(const char *name);
    // What LD_PRELOAD, which takes no blanks, can name; and the file itself.
    QString observer() const { return at(QStringLiteral("observer.so")); }
    static QString builtObserver();

    // Font configurations, by at(): the fonts that the package depends on; the same and 500 more families.
    static constexpr char kFewFonts[] = "few-fonts";
    static constexpr char kManyFonts[] = "many-fonts";

    // The display, the bus and the few fonts, for a process started by hand.
    QProcessEnvironment environment() const;

    // Runs to the end and gives the seconds that it took. `allowed`: exit codes that are no failure.
    double run(const QStringList &command, const QProcessEnvironment &environment) const;

    // Makes an executable shell script of `command`.
    QString script(const QString &name, const QString &command) const;

    // As the shell takes it for one word.
    static QString quoted(QString word);

    // Instructions in a file that callgrind has written.
    static double instructions(const QString &callgrindFile);

    [[noreturn]] static void giveUp(const QString &why);

private:
    QString write(const QString &name, const QByteArray &content) const;
    void link(const QString &font, const QString &name) const;
    void makeFonts() const;
    QString startServer(QProcess &server, const QString &program, const QStringList &arguments);

    QTemporaryDir m_directory;
    QProcess m_display;
    QProcess m_bus;
    QString m_displayName;
    QString m_busAddress;
};
