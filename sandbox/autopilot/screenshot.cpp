// SPDX-License-Identifier: Apache-2.0
#include "screenshot.h"

#include "waitfor.h"

#include <QDir>
#include <QGuiApplication>
#include <QPixmap>
#include <QScreen>

namespace sandbox {

namespace {

constexpr int kStandstillMs = 1000; // a spinner never stands still

} // namespace

void saveScreenshot(const QString &directory, const QString &name, const std::function<QRect()> &place)
{
    QImage last;
    bool standsStill = false;
    for (const QDeadlineTimer limit(kStandstillMs); !standsStill && !limit.hasExpired();) {
        const QRect where = place();
        if (where.isEmpty())
            break;
        const QPixmap screen = QGuiApplication::primaryScreen()->grabWindow(0, where.x(), where.y(),
                                                                            where.width(), where.height());
        const QImage now = screen.toImage();
        standsStill = now == last;
        last = now;
        QThread::msleep(kPollInterval);
    }
    const QString path = QStringLiteral("%1/%2.png").arg(directory, name);
    if (!last.isNull() && !(QDir().mkpath(directory) && last.save(path)))
        throw Error(QStringLiteral("cannot write the screenshot %1").arg(path));
}

} // namespace sandbox
