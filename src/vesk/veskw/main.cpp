// SPDX-License-Identifier: Apache-2.0
#include "busthread.h"
#include "coredumps.h"
#include "logging.h"
#include "pageparts.h"
#include "widget.h"
#include "windowparts.h"

#include "mtk/mapplication.h"

#include <QGuiApplication>
#include <QScreen>

#include <QDebug>

namespace {

// On the whole screen, panels included, counted from the desktop's origin.
void centreOnPrimaryScreen(QWidget &window)
{
    const QSize screen = QGuiApplication::primaryScreen()->size();
    window.setGeometry(QRect(QPoint(0, 0), windowparts::windowSize(pageparts::kFieldPageSize)));
    window.move((screen.width() - window.width()) / 2, (screen.height() - window.height()) / 2);
}

} // namespace

int main(int argc, char **argv)
{
    vesk::uOpenlog(vesk::LevelDebug);
    coredumps::disable();
    if (!startBusThread()) {
        qCritical() << "no start: the D-Bus library cannot start its thread";
        return 1;
    }

    Mtk::Widget::MApplication application(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("维斯克平台"));
    QObject::connect(&application, &Mtk::Widget::MApplication::firstPainted,
                     [] { QApplication::setWindowIcon(windowparts::logo()); });
    if (!application.setSingleInstance(QStringLiteral("veskw"))) {
        pageparts::showMessage(nullptr, QStringLiteral("进程已存在"));
        return 0;
    }

    qDebug() << "into main.....";
    Widget window(nullptr);
    centreOnPrimaryScreen(window);
    window.show();
    return QApplication::exec();
}
