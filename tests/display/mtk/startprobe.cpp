// SPDX-License-Identifier: Apache-2.0
// Starts as programs of the desktop do. "claim KEY" prints "won" or "lost" and lives until its input ends.
// "leave-child KEY" claims, prints the process id of a child that lives on for a while, and goes. "look KEY"
// prints style, font and colors, and goes. The directory FOREIGN_DIRECTORY is another user's for it.
#include "mtk/mapplication.h"
#include "pretendedowner.h"

#include <QProcess>
#include <QStyle>
#include <QTextStream>
#include <QToolTip>

#include <optional>

#include <unistd.h>

int main(int argc, char **argv)
{
    Mtk::Widget::MApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    if (arguments.size() != 3)
        return 2;
    if (arguments.at(1) == QLatin1String("look")) {
        QCoreApplication::processEvents(); // as plugins of the desktop need to set theirs
        QTextStream(stdout) << QApplication::style()->metaObject()->className() << " "
                            << QApplication::font().toString() << " "
                            << QApplication::palette().base().color().name() << " "
                            << QToolTip::palette().toolTipBase().color().name() << "\n";
        return 0;
    }
    const QByteArray foreign = qgetenv("FOREIGN_DIRECTORY");
    std::optional<PretendedOwner> pretended;
    if (!foreign.isEmpty()) {
        pretended.emplace(getuid());
        PretendedOwner::giveTo(foreign.toStdString(), getuid() + 1);
    }
    const bool won = application.setSingleInstance(arguments.at(2));
    if (arguments.at(1) == QLatin1String("leave-child")) {
        qint64 child = 0;
        QProcess::startDetached(QStringLiteral("sleep"), {QStringLiteral("20")}, QString(), &child);
        QTextStream(stdout) << child << "\n";
        return won ? 0 : 1;
    }
    QTextStream(stdout) << (won ? "won" : "lost") << "\n";
    QTextStream(stdin).readAll();
    return 0;
}
