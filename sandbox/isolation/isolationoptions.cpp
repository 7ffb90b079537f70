// SPDX-License-Identifier: Apache-2.0
#include "isolationoptions.h"

#include <QFileInfo>

namespace sandbox {

namespace {

using Backend = IsolationOptions::Backend;

bool addBind(IsolationOptions *options, const Bind &bind, QString *error)
{
    if (!QFileInfo::exists(bind.host)) {
        *error = QStringLiteral("cannot bind %1: no such file or folder").arg(bind.host);
        return false;
    }
    if (!bind.inside.startsWith(QLatin1Char('/'))) {
        *error = QStringLiteral("cannot bind %1: %2 is not an absolute path").arg(bind.host, bind.inside);
        return false;
    }
    options->binds.append({QFileInfo(bind.host).canonicalFilePath(), bind.inside, bind.writable});
    return true;
}

bool takeValue(IsolationOptions *options, const QString &name, const QString &value, QString *error)
{
    if (name == QLatin1String("--root")) {
        options->root = value;
        return true;
    }
    if (name == QLatin1String("--writable"))
        return addBind(options, {value, QFileInfo(value).absoluteFilePath(), true}, error);
    if (name == QLatin1String("--read-only")) {
        options->readOnly.append(value);
        return true;
    }
    const QChar separator = QLatin1Char(name == QLatin1String("--bind") ? ':' : '=');
    const auto at = value.indexOf(separator);
    if (at < 1) {
        *error = QStringLiteral("%1 %2: there is no \"%3\" in it").arg(name, value).arg(separator);
        return false;
    }
    if (separator == QLatin1Char(':'))
        return addBind(options, {value.left(at), value.mid(at + 1), false}, error);
    options->environment.append({value.left(at), value.mid(at + 1)});
    return true;
}

} // namespace

bool IsolationOptions::parse(const QStringList &arguments, IsolationOptions *options, QString *error)
{
    static const QStringList withValue = {QStringLiteral("--root"), QStringLiteral("--bind"),
                                          QStringLiteral("--writable"), QStringLiteral("--read-only"),
                                          QStringLiteral("--setenv")};
    for (int i = 0; i < arguments.size(); ++i) {
        const QString &argument = arguments.at(i);
        if (argument == QLatin1String("--")) {
            options->command = arguments.mid(i + 1);
            break;
        }
        if (argument == QLatin1String("--bwrap")) {
            options->backend = Backend::Bubblewrap;
        } else if (argument == QLatin1String("--proot")) {
            options->backend = Backend::Proot;
        } else if (!withValue.contains(argument)) {
            *error = QStringLiteral("unknown option %1 (the command stands after \"--\")").arg(argument);
            return false;
        } else if (i + 1 == arguments.size()) {
            *error = QStringLiteral("%1 needs a value").arg(argument);
            return false;
        } else if (!takeValue(options, argument, arguments.at(++i), error)) {
            return false;
        }
    }
    if (options->command.isEmpty())
        *error = QStringLiteral("no command given");
    return !options->command.isEmpty();
}

QString IsolationOptions::usage()
{
    return QStringLiteral(
        "usage: vesk-isolate [OPTION]... -- COMMAND [ARGUMENT]...\n"
        "Runs COMMAND with /etc/vesk, /usr/share/vesk, /tmp, /etc/hostname, /etc/hosts and /run of its own,\n"
        "without capabilities and without a controlling terminal.\n"
        "  --root DIR          take them from DIR/etc/vesk and so on (default: a fresh folder, removed "
        "afterwards)\n"
        "  --bind HOST:INSIDE  show HOST at INSIDE, read-only\n"
        "  --writable PATH     let COMMAND write to PATH; all else of the machine is read-only\n"
        "  --read-only PATH    COMMAND finds one of its own paths on a read-only file system (bubblewrap "
        "only)\n"
        "  --setenv NAME=VALUE set a variable for COMMAND\n"
        "  --bwrap, --proot    use this tool (default: bubblewrap where it works, else proot)\n"
        "proot cannot make the machine read-only: there only the paths above are replaced.\n");
}

} // namespace sandbox
