// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QPair>
#include <QStringList>
#include <QVector>

namespace sandbox {

// A path of the machine and the absolute path where the isolated command sees it.
struct Bind
{
    QString host;
    QString inside;
    bool writable = false;
};

// What the user of vesk-isolate asked for. parse() understands the command line and checks that every bound
// path exists; it starts and creates nothing.
struct IsolationOptions
{
    enum class Backend { Choose, Bubblewrap, Proot };

    Backend backend = Backend::Choose;
    QString root; // directory that stands in for the replaced paths; empty: a fresh one for this run
    QVector<Bind> binds;
    QStringList readOnly;
    QVector<QPair<QString, QString>> environment;
    QStringList command;

    // arguments: the program's own name first. Throws an Error. Help and version are shown here, and end the
    // process.
    static IsolationOptions parse(const QStringList &arguments);
};

} // namespace sandbox
