// SPDX-License-Identifier: Apache-2.0
#include "screenshots.h"

#include "section.h"

#include <QApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QTextStream>
#include <QWidget>

#include <algorithm>
#include <memory>

namespace Gallery {

namespace {

constexpr int kSettleTime = 250; // milliseconds, longer than any animation of the toolkit

// Spins the event loop until layout, focus and animations have settled.
void settle()
{
    QElapsedTimer clock;
    clock.start();
    while (clock.elapsed() < kSettleTime)
        QApplication::processEvents(QEventLoop::AllEvents, kSettleTime);
}

bool write(const Section &section, const QDir &directory)
{
    const std::unique_ptr<QWidget> widget(section.make());
    // With the round corners that windows have on a desktop with a compositor.
    widget->setAttribute(Qt::WA_TranslucentBackground,
                         widget->windowFlags().testFlag(Qt::FramelessWindowHint));
    widget->show();
    widget->activateWindow();
    settle();
    const QString file = directory.filePath(section.name + QStringLiteral(".png"));
    if (widget->grab().save(file))
        return true;
    QTextStream(stderr) << "cannot write " << file << "\n";
    return false;
}

} // namespace

bool writeScreenshots(const QString &directory)
{
    const QDir target(directory);
    if (!target.mkpath(QStringLiteral("."))) {
        QTextStream(stderr) << "cannot create the directory " << directory << "\n";
        return false;
    }
    const QVector<Section> sections = controlSections() + surfaceSections();
    return std::all_of(sections.begin(), sections.end(),
                       [&target](const Section &section) { return write(section, target); });
}

} // namespace Gallery
