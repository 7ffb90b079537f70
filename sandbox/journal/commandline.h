// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

#include <initializer_list>

class QCommandLineParser;

namespace sandbox::commandline {

struct Option
{
    const char *name;
    const char *text;
    const char *value = ""; // what stands after it; empty: nothing
    const char *standard = "";
};

// Adds the options, --help and --version to `parser` and reads `arguments`, of which the first is the
// program's name. Help and version are shown here, which ends the process. Returns one line when something is
// wrong with the arguments. The application object must exist.
QString parse(QCommandLineParser &parser, const QStringList &arguments, const char *description,
              std::initializer_list<Option> options = {});

// One line on standard output, at once.
void say(const QString &line);
// One line on standard error that begins with the program's name. Returns `exitCode`.
int fail(const QString &reason, int exitCode);

} // namespace sandbox::commandline
