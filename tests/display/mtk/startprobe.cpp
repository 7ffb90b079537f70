// SPDX-License-Identifier: Apache-2.0
// Starts as programs of the desktop do. "claim KEY" prints "won" or "lost" and lives until its input ends;
// "leave-child KEY" claims, leaves a child behind that lives until the input ends, and goes.
#include "mtk/mapplication.h"

#include <QTextStream>

#include <unistd.h>

namespace {

void waitForEndOfInput()
{
    QTextStream(stdin).readAll();
}

void print(const char *line)
{
    QTextStream(stdout) << line << "\n";
}

} // namespace

int main(int argc, char **argv)
{
    Mtk::Widget::MApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    if (arguments.size() != 3)
        return 2;
    const bool won = application.setSingleInstance(arguments.at(2));
    if (arguments.at(1) == QLatin1String("leave-child")) {
        // cat holds nothing but what it inherits, and ends with its input.
        if (fork() == 0) {
            execlp("cat", "cat", static_cast<char *>(nullptr));
            _exit(127);
        }
        print(won ? "won" : "lost");
        return 0;
    }
    print(won ? "won" : "lost");
    waitForEndOfInput();
    return 0;
}
