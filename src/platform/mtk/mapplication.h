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

// The application object of a program of the desktop, made first thing in main(). Brings the theme, one font
// that has Chinese glyphs, sharp drawing on dense screens, and a start without OpenGL unless
// QT_XCB_GL_INTEGRATION is set. Without a display that can be reached the constructor says so in one critical
// message and ends the process with status 1. In all windows, what a modal window or not being shown keeps
// from mouse and keyboard is kept from assistive technology too.
class MTK_EXPORT MApplication : public QApplication
{
    Q_OBJECT
    // While true the application shows a busy cursor, whatever the user does by mouse, keyboard, touch or
    // assistive technology is dropped, a press that began before included, and windows refuse to close. Each
    // true needs a false of its own, so busy sections may nest.
    Q_PROPERTY(bool busy READ isBusy WRITE setBusy)

public:
    // `argc` and `argv` must outlive the object.
    MApplication(int &argc, char **argv);
    ~MApplication() override;

    // Claims `key` for this process and returns true, or returns false while another process of the same user
    // session holds it. The claim is a kernel lock on a file: it ends with the process, however that ends,
    // child processes don't hold it, and of many simultaneous starts exactly one wins. The file lies in the
    // first of $XDG_RUNTIME_DIR, /run/user/UID, /tmp/runtime-NAME and ~/.cache that is the user's own and
    // that nobody else can write to. Where none is, one warning is logged and the answer is true: a user
    // would rather have two windows than none. Asking again for a key already held gives true.
    bool setSingleInstance(const QString &key);

    bool isBusy() const;
    void setBusy(bool busy);

    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    void dropGlRequest();

    QMap<QString, int> m_claims; // key to open lock file; held until the process ends
    int m_busyDepth = 0;
    std::unique_ptr<InputGate> m_gate;
};

} // namespace Mtk::Widget
