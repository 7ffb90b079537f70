// SPDX-License-Identifier: Apache-2.0
#include "camera.h"

#include "patience.h"

#include <QGuiApplication>
#include <QPixmap>
#include <QScreen>

namespace sandbox {

namespace {

constexpr int kStandstill = 1000; // milliseconds; a spinner never stands still

QImage grab(const QRect &place)
{
    return QGuiApplication::primaryScreen()
        ->grabWindow(0, place.x(), place.y(), place.width(), place.height())
        .toImage();
}

} // namespace

Camera::Camera(const QString &folder)
    : m_folder(folder)
{
    if (isWanted() && !QDir().mkpath(m_folder))
        throw Trouble(QStringLiteral("cannot make the folder %1 for pictures").arg(m_folder));
}

void Camera::take(const QString &name, const std::function<QRect()> &place) const
{
    if (!isWanted())
        return;
    QImage last;
    const QDeadlineTimer patience(kStandstill);
    while (!patience.hasExpired()) {
        const QRect where = place();
        if (where.isEmpty())
            break;
        const QImage now = grab(where);
        const bool standsStill = !last.isNull() && now == last;
        last = now;
        if (standsStill)
            break;
        QThread::msleep(kPollInterval);
    }
    if (!last.isNull())
        save(last, name);
}

void Camera::save(const QImage &picture, const QString &name) const
{
    const QString path = QDir(m_folder).filePath(name + QStringLiteral(".png"));
    if (!picture.save(path))
        throw Trouble(QStringLiteral("cannot write the picture %1").arg(path));
}

} // namespace sandbox
