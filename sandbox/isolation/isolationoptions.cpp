// SPDX-License-Identifier: Apache-2.0
#include "isolationoptions.h"

#include "journal/commandline.h"
#include "journal/error.h"

#include <QCommandLineParser>
#include <QFileInfo>

#include <algorithm>

namespace sandbox {

namespace {

constexpr char kDescription[] =
    "Runs COMMAND with /etc/vesk, /usr/share/vesk, /tmp, /etc/hostname, /etc/hosts and /run of its own,\n"
    "without capabilities and without a controlling terminal.\n"
    "proot cannot make the machine read-only: there only the paths above are replaced.";

QPair<QString, QString> halves(const QString &option, const QString &value, QChar separator)
{
    const auto at = value.indexOf(separator);
    if (at < 1)
        throw Error(QStringLiteral("--%1 %2: there is no \"%3\" in it").arg(option, value, separator));
    return {value.left(at), value.mid(at + 1)};
}

Bind bindOf(const QString &host, const QString &inside, bool writable)
{
    if (!QFileInfo::exists(host))
        throw Error(QStringLiteral("cannot bind %1: no such file or directory").arg(host));
    if (!inside.startsWith(QLatin1Char('/')))
        throw Error(QStringLiteral("cannot bind %1: %2 is not an absolute path").arg(host, inside));
    return {QFileInfo(host).canonicalFilePath(), inside, writable};
}

void take(const QCommandLineParser &parser, IsolationOptions *options)
{
    using Backend = IsolationOptions::Backend;
    const QString bind = QStringLiteral("bind");
    const QString setenv = QStringLiteral("setenv");
    if (parser.isSet(QStringLiteral("bwrap")))
        options->backend = Backend::Bubblewrap;
    if (parser.isSet(QStringLiteral("proot")))
        options->backend = Backend::Proot;
    options->root = parser.value(QStringLiteral("root"));
    options->readOnly = parser.values(QStringLiteral("read-only"));
    for (const QString &path : parser.values(QStringLiteral("writable")))
        options->binds.append(bindOf(path, QFileInfo(path).absoluteFilePath(), true));
    for (const QString &value : parser.values(bind)) {
        const auto paths = halves(bind, value, QLatin1Char(':'));
        options->binds.append(bindOf(paths.first, paths.second, false));
    }
    // What lies inside another path comes after it.
    std::stable_sort(options->binds.begin(), options->binds.end(),
                     [](const Bind &left, const Bind &right) { return left.inside < right.inside; });
    for (const QString &value : parser.values(setenv))
        options->environment.append(halves(setenv, value, QLatin1Char('=')));
}

} // namespace

IsolationOptions IsolationOptions::parse(const QStringList &arguments)
{
    IsolationOptions options;
    const auto end = arguments.indexOf(QStringLiteral("--"));
    QCommandLineParser parser;
    parser.addPositionalArgument(QStringLiteral("command"), QStringLiteral("After \"--\"."),
                                 QStringLiteral("-- COMMAND [ARGUMENT]..."));
    const QString error = commandline::parse(
        parser, arguments.mid(0, end), kDescription,
        {{"root", "Take them from DIR/etc/vesk and so on (default: a fresh directory, removed afterwards).",
          "DIR"},
         {"bind", "Show HOST at INSIDE, read-only.", "HOST:INSIDE"},
         {"writable", "Let COMMAND write to PATH; all else of the machine is read-only.", "PATH"},
         {"read-only", "COMMAND finds one of its own paths on a read-only file system (bubblewrap only).",
          "PATH"},
         {"setenv", "Set a variable for COMMAND.", "NAME=VALUE"},
         {"bwrap", "Use bubblewrap (default: where it works, else proot)."},
         {"proot", "Use proot."}});
    if (!error.isEmpty())
        throw Error(error);
    if (!parser.positionalArguments().isEmpty())
        throw Error(QStringLiteral("unknown argument %1 (the command stands after \"--\")")
                        .arg(parser.positionalArguments().constFirst()));
    if (end < 0 || end + 1 == arguments.size())
        throw Error(QStringLiteral("no command given"));
    take(parser, &options);
    options.command = arguments.mid(end + 1);
    return options;
}

} // namespace sandbox
