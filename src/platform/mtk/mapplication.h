// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QApplication>
#include <QMap>

#include <memory>

namespace Mtk {
class InputGate;
}

namespace Mtk::Widget {

// The application object, created first in main(). Sets the theme, a font with Chinese glyphs, high-DPI
// scaling by the exact factor of the desktop unless QT_SCALE_FACTOR_ROUNDING_POLICY is set, the executable's
// name as that of the desktop file, and a start without OpenGL unless QT_XCB_GL_INTEGRATION is set. No other
// setting of the desktop or the environment replaces the theme. Where no display can be reached, the
// constructor logs one critical message and ends the process with status 1. A widget that mouse and keyboard
// cannot reach, because it is hidden or behind a modal window, cannot be operated by assistive technology
// either; it is told of no letter of a secret text, and of none in a field that does not show. A key that is
// held presses a button or answers a dialog once; what edits text repeats.
class MTK_EXPORT MApplication : public QApplication
{
    Q_OBJECT
    // While true, the application shows a busy cursor, drops all input by mouse, keyboard, touch and
    // assistive technology, including a press that began before, and windows refuse to close. Busy sections
    // nest: each true needs its own false. A false too many is ignored.
    Q_PROPERTY(bool busy READ isBusy WRITE setBusy)

public:
    // `argc` and `argv` must outlive the object.
    MApplication(int &argc, char **argv);
    ~MApplication() override;

    // Claims `key`, which may be any text, for this process and returns true; returns false while another
    // process of the same user session holds it. The claim is a kernel lock on a file: it ends with the
    // process, however that ends, child processes don't inherit it, and of many simultaneous starts exactly
    // one wins. The file lies in the first of $XDG_RUNTIME_DIR, /run/user/UID, /tmp/runtime-NAME and ~/.cache
    // that belongs to the user and is not writable by others. If there is none, one warning is logged and the
    // answer is true: two windows are better than none. For a key that this process already holds the answer
    // is true.
    bool setSingleInstance(const QString &key);

    bool isBusy() const;
    void setBusy(bool busy);

    bool eventFilter(QObject *watched, QEvent *event) override;
    bool notify(QObject *receiver, QEvent *event) override;

Q_SIGNALS:
    // Once, when the first window has been painted: for what need not be there before.
    void firstPainted();

private:
    void dropGlRequest();

    QMap<QString, int> m_claims; // key to open lock file; held until the process ends
    int m_busyDepth = 0;
    std::unique_ptr<InputGate> m_gate;
};

} // namespace Mtk::Widget
