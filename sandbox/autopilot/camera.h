// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDir>
#include <QImage>
#include <QRect>

#include <functional>

namespace sandbox {

/// Takes pictures of parts of the screen, as PNG files in one folder. Needs a QGuiApplication on the display
/// of the program, started with the same scale factor, as soon as a picture is taken.
class Camera
{
public:
    /// An empty folder means that no pictures are wanted.
    explicit Camera(const QString &folder);

    bool isWanted() const { return !m_folder.isEmpty(); }

    /// Waits up to a second for the picture to stand still, since a window may be half painted. `place` says
    /// where to look now, and gives an empty rectangle when the thing is gone: then the last picture counts.
    /// Throws a Trouble when the file cannot be written.
    void take(const QString &name, const std::function<QRect()> &place) const;

private:
    void save(const QImage &picture, const QString &name) const;

    QString m_folder;
};

} // namespace sandbox
