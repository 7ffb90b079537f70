// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QObject>

// While it lives, nothing that the user does reaches the program: input is discarded, windows refuse to
// close, and the application's property "busy" is true, which the toolkit shows as a cursor. Everything else
// (painting, timers, replies of services) goes on. For the application's thread; guards may nest.
class InputGuard : public QObject
{
    Q_OBJECT

public:
    InputGuard();
    ~InputGuard() override;

    // Discards what the user did until now and what is still queued. Call it last.
    static void drain();

    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    bool m_busyBefore;
};
