// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QWidget>

class QPushButton;

// Last page of a join: one sentence and a button that reboots the machine. Widget shows it in a window of its
// own.
class JoinGroupSuccessWidget : public QWidget
{
    Q_OBJECT

public:
    explicit JoinGroupSuccessWidget(QWidget *parent);

public Q_SLOTS:
    // Blocks until the login manager has answered. A refused reboot is silent; the button can be pressed
    // again.
    void onRestartComputer();

private:
    // Returns the button, which no member holds.
    QPushButton *createInterface();
    void createConnections(QPushButton *rebootButton);
};
