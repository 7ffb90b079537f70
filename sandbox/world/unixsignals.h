// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QObject>

namespace sandbox {

// TERM, INT and HUP as a Qt signal, delivered in the event loop. One object in a process.
class UnixSignals : public QObject
{
    Q_OBJECT

public:
    UnixSignals();
    ~UnixSignals() override;

Q_SIGNALS:
    void received(int number);
};

} // namespace sandbox
